// What a driver skips in a configuration without a word.
#pragma once

#include <string>

#include "cli/Command.h"
#include "platform/IProtocol.h"

namespace cli {

/// Complains about every key of the configuration that the driver's description does not know,
/// each once, with the nearest one that it knows; nothing where a driver has no description.
void warnOfUnknownKeys(CommandContext& context, const IProtocol& protocol,
                       const std::string& configText);

}  // namespace cli
