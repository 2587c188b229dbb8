// The complaints of the rooms below as failures of the command.
#pragma once

#include "cli/ExitCode.h"
#include "settings/TextError.h"
#include "values/ValueError.h"

namespace cli {

/// Runs a step in which a user's words are read. What values/ and settings/ say against them
/// becomes a CommandError (Usage) here and nowhere else; all other exceptions pass.
template <class Step>
decltype(auto) withUsageErrors(Step&& step) {
    try {
        return step();
    } catch (const values::ValueError& error) {
        throw CommandError(ExitCode::Usage, error.what());
    } catch (const settings::TextError& error) {
        throw CommandError(ExitCode::Usage, error.what());
    }
}

}  // namespace cli
