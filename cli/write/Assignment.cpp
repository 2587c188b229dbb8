// Splits "URI=VALUE".
#include "cli/write/Assignment.h"

#include <fmt/format.h>

#include "cli/ExitCode.h"

namespace cli {

Assignment parseAssignment(const std::string& text) {
    const std::size_t equals = text.find('=');
    if (equals == std::string::npos) {
        throw CommandError(ExitCode::Usage, fmt::format("'{}' is no URI=VALUE", text));
    }
    if (equals == 0) {
        throw CommandError(ExitCode::Usage, fmt::format("'{}' has no URI in front of '='", text));
    }
    return {text.substr(0, equals), text.substr(equals + 1)};
}

}  // namespace cli
