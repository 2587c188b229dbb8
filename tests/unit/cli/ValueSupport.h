// Helpers of the tests about values.
#pragma once

#include <string>
#include <string_view>

#include "cli/ExitCode.h"
#include "cli/Values.h"

namespace cli_test {

/// @return the complaint about a text that is no value; "accepted" when there is none.
inline std::string refusal(cli::ValueShape shape, std::string_view text) {
    try {
        cli::parseValue(shape, text);
    } catch (const cli::CommandError& error) {
        return error.code() == cli::ExitCode::Usage ? error.what() : "wrong exit code";
    }
    return "accepted";
}

inline cli::Bytes bytesOf(std::string_view text) {
    return {text.begin(), text.end()};
}

}  // namespace cli_test
