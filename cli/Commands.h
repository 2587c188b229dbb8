// The sub-commands of `mrtu`, one function each.
#pragma once

#include "cli/Command.h"
#include "cli/CommandSpec.h"

namespace cli {

CommandSpec readCommand(CommandContext& context);
CommandSpec writeCommand(CommandContext& context);
CommandSpec simCommand(CommandContext& context);
CommandSpec infoCommand(CommandContext& context);
CommandSpec consoleCommand(CommandContext& context);
CommandSpec overrideCommand(CommandContext& context);
CommandSpec describeCommand(CommandContext& context);
CommandSpec checkCommand(CommandContext& context);
CommandSpec planCommand(CommandContext& context);
CommandSpec pollCommand(CommandContext& context);
CommandSpec inspectCommand(CommandContext& context);

}  // namespace cli
