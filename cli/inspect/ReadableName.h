// C++ names as their author wrote them. Pure.
#pragma once

#include <string>

namespace cli {

/// @return the demangled name; the name itself where it is no mangled one, and where it might grow
/// beyond reason: a mangled name can refer back to its own parts, so that two hundred characters
/// stand for more text than there is memory.
std::string readableName(const std::string& mangled);

}  // namespace cli
