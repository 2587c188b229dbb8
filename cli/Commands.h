// The sub-commands of `mrtu`, one function each.
#pragma once

#include "cli/Command.h"

namespace cli {

void addReadCommand(CLI::App& app, CommandContext& context);
void addWriteCommand(CLI::App& app, CommandContext& context);
void addSimCommand(CLI::App& app, CommandContext& context);
void addInfoCommand(CLI::App& app, CommandContext& context);
void addConsoleCommand(CLI::App& app, CommandContext& context);
void addOverrideCommand(CLI::App& app, CommandContext& context);
void addDescribeCommand(CLI::App& app, CommandContext& context);
void addCheckCommand(CLI::App& app, CommandContext& context);
void addInspectCommand(CLI::App& app, CommandContext& context);

}  // namespace cli
