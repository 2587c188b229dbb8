// The texts behind a word that is none of those accepted.
#include "cli/Choices.h"

#include <fmt/format.h>
#include <fmt/ranges.h>
#include <strings.h>

#include <charconv>

#include "values/NearestName.h"

namespace cli {

bool sameWord(std::string_view a, std::string_view b) {
    return a.size() == b.size() && strncasecmp(a.data(), b.data(), a.size()) == 0;
}

std::string didYouMean(std::string_view word, const std::vector<std::string>& names) {
    const std::string nearest = values::nearestName(word, names);
    // Numbers that differ in two digits have nothing to do with each other.
    const bool number = word.find_first_not_of("0123456789") == std::string_view::npos;
    if (nearest.empty() || (number && values::editDistance(word, nearest) > 1)) return {};
    return fmt::format("; did you mean '{}'?", nearest);
}

std::string notOneOf(std::string_view word, const std::vector<std::string>& choices) {
    return fmt::format("'{}' is not one of {}{}", word, fmt::join(choices, ", "),
                       didYouMean(word, choices));
}

long plainNumber(std::string_view text, long largest) {
    long number = -1;
    const char* const end = text.data() + text.size();
    if (text.starts_with('-')) return -1;
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    return error == std::errc{} && stop == end && number <= largest ? number : -1;
}

}  // namespace cli
