// Demangles a C++ name, as far as it is one.
#include "cli/inspect/ReadableName.h"

#include <cxxabi.h>

#include <cstdlib>
#include <memory>

namespace cli {
namespace {

constexpr std::size_t kLongestName = 500;
/// Three references to a part that holds three of them, and so on: at most 3^(16 / 3), 350 times
/// the length.
constexpr int kMostReferences = 16;

bool isReferenceDigit(char c) {
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z');
}

/// Counts "S_", "S0_", "T_", "T1_" ... and whatever looks alike.
int referencesIn(const std::string& name) {
    int count = 0;
    for (std::size_t at = 0; at < name.size(); ++at) {
        if (name[at] != 'S' && name[at] != 'T') continue;
        std::size_t end = at + 1;
        while (end < name.size() && isReferenceDigit(name[end]))
            ++end;
        if (end < name.size() && name[end] == '_') ++count;
    }
    return count;
}

bool staysSmall(const std::string& name) {
    // "Dp" repeats what follows for every part of a list.
    return name.size() <= kLongestName && name.find("Dp") == std::string::npos &&
           referencesIn(name) <= kMostReferences;
}

}  // namespace

std::string readableName(const std::string& mangled) {
    if (!mangled.starts_with("_Z") || !staysSmall(mangled)) return mangled;
    int status = 0;
    const std::unique_ptr<char, decltype(&std::free)> text(
        abi::__cxa_demangle(mangled.c_str(), nullptr, nullptr, &status), &std::free);
    return status == 0 && text != nullptr ? text.get() : mangled;
}

}  // namespace cli
