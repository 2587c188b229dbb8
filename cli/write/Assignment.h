// "URI=VALUE" on the command line. Pure.
#pragma once

#include <string>

namespace cli {

struct Assignment {
    std::string uri;
    std::string value;
};

/// Splits at the first "=": a URI holds none, a value may.
/// Errors: CommandError (Usage) without "=" and for an empty URI.
Assignment parseAssignment(const std::string& text);

}  // namespace cli
