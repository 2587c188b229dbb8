// How a stored value reads as text, number and boolean.
#include "runtime/StoredValue.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <limits>

namespace runtime {
namespace {

int intFromText(const std::string& text) {
    // strtol() stops at the ends of long by itself; where int is narrower it is narrowed here.
    const long number = std::strtol(text.c_str(), nullptr, 0);
    constexpr long kLeast = std::numeric_limits<int>::min();
    constexpr long kMost = std::numeric_limits<int>::max();
    return static_cast<int>(std::clamp(number, kLeast, kMost));
}

template <class... Handlers>
struct Match : Handlers... {
    using Handlers::operator()...;
};
template <class... Handlers>
Match(Handlers...) -> Match<Handlers...>;

}  // namespace

std::string storedText(const StoredValue& value) {
    return std::visit(Match{[](const std::string& text) { return text; },
                            [](bool flag) { return std::string(flag ? "1" : "0"); },
                            [](int number) { return std::to_string(number); }},
                      value);
}

int storedInt(const StoredValue& value) {
    return std::visit(
        Match{[](const std::string& text) { return intFromText(text); },
              [](bool flag) { return flag ? 1 : 0; }, [](int number) { return number; }},
        value);
}

bool storedBool(const StoredValue& value) {
    if (const auto* text = std::get_if<std::string>(&value); text != nullptr && *text == "true") {
        return true;
    }
    return storedInt(value) != 0;
}

const char* storedTypeName(const StoredValue& value) {
    return std::visit(Match{[](const std::string&) { return "text"; }, [](bool) { return "bool"; },
                            [](int) { return "int"; }},
                      value);
}

}  // namespace runtime
