// What an option's word may be, and the complaint when it is not.
#include "cli/Validators.h"

#include <fmt/format.h>

#include "cli/Choices.h"

namespace cli {

WordCheck notEmpty() {
    return [](const std::string& word) { return word.empty() ? "an empty word" : std::string(); };
}

WordCheck oneOf(const std::vector<std::string>& choices) {
    return [choices](std::string& word) -> std::string {
        for (const std::string& choice : choices) {
            if (!sameWord(word, choice)) continue;
            word = choice;
            return {};
        }
        return notOneOf(word, choices);
    };
}

WordCheck numberUpTo(long largest) {
    return [largest](std::string& word) -> std::string {
        const long number = plainNumber(word, largest);
        if (number < 0) return fmt::format("'{}' is no number from 0 to {}", word, largest);
        word = std::to_string(number);
        return {};
    };
}

}  // namespace cli
