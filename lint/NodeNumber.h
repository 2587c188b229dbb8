// What becomes of a node's number on the line. Pure.
#pragma once

#include <string>

namespace lint {

/// @return why the node can't be talked to by its number, or empty when it can. An override may
/// give it another number at run time.
std::string nodeFault(long node);

inline constexpr const char* kUsableNodes = "devices have the numbers 1 to 247";

}  // namespace lint
