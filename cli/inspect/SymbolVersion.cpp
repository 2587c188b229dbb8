// Finds the newest of versions like GLIBC_2.34.
#include "cli/inspect/SymbolVersion.h"

#include <charconv>
#include <string_view>

namespace cli {
namespace {

constexpr std::string_view kPrefix = "GLIBC_";

/// "2.17" -> {2, 17}; empty for anything but numbers between dots.
std::vector<int> numbersOf(std::string_view text) {
    std::vector<int> numbers;
    const char* at = text.data();
    const char* const end = at + text.size();
    for (;;) {
        int number = 0;
        const auto [stop, error] = std::from_chars(at, end, number);
        if (error != std::errc{} || number < 0) return {};
        numbers.push_back(number);
        if (stop == end) return numbers;
        if (*stop != '.') return {};
        at = stop + 1;
    }
}

}  // namespace

std::string newestGlibc(const std::vector<std::string>& versions) {
    std::string newest;
    std::vector<int> newestNumbers;
    for (const std::string& version : versions) {
        if (!version.starts_with(kPrefix)) continue;
        const std::vector<int> numbers =
            numbersOf(std::string_view(version).substr(kPrefix.size()));
        if (numbers <= newestNumbers) continue;
        newest = version.substr(kPrefix.size());
        newestNumbers = numbers;
    }
    return newest;
}

}  // namespace cli
