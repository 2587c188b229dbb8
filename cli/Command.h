// What every sub-command of `mrtu` shares, and how sub-commands are added.
//
// A sub-command is one function `CommandSpec xyCommand(CommandContext& context)`, which names its
// options and its action. The action runs after the whole command line was accepted; it prints
// results on context.out, complaints on context.err, and either stores context.exitCode or throws
// CommandError.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

#include "cli/ExitCode.h"

namespace cli {

struct CommandSpec;

/// Lives from before the command line is parsed until after the action.
struct CommandContext {
    std::ostream& out;
    std::ostream& err;
    /// The action's verdict.
    ExitCode exitCode = ExitCode::Done;
    /// What --plugin said; empty for the default places. Ask pluginFile() instead.
    std::string pluginOption;
    /// What complain() has said so far.
    std::vector<std::string> complaints{};
    /// Where a command writes that does not end by itself, and what it writes is to be seen at
    /// once: with --json, `out` is kept back until the end. Null: `out`.
    std::ostream* liveOut = nullptr;
    /// Whether anything went to `liveOut`; it is the whole answer then.
    bool wroteLive = false;
};

/// Declares `--plugin FILE` on a sub-command that loads the driver.
void addPluginOption(CommandSpec& command, CommandContext& context);

/// @return the plug-in to load: what --plugin named, else the first that exists of "libmrtu.so"
/// beside the executable and "../lib/mrtu/libmrtu.so" relative to the executable's folder.
/// Errors: CommandError (Other) naming the places looked at when there is none.
std::string pluginFile(const CommandContext& context);

/// Prints "mrtu: " and the text as one line on context.err.
void complain(CommandContext& context, const std::string& text);

/// @return what the whole command line may hold. Its actions use `context`, which must outlive
/// them.
CommandSpec commandLine(CommandContext& context);

/// Runs a whole command line, also `--help` and `--version`. With `--json` among the words, `out`
/// gets one JSON document in every case: what the command printed, or, when it ended before,
/// {"exitCode": 2, "errors": ["..."]} with the complaints. Of `poll` each line is a document.
/// @return what main() returns: the number of an ExitCode.
int runCommandLine(int argc, const char* const* argv, std::ostream& out, std::ostream& err);

}  // namespace cli
