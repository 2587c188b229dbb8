// What the storage holds that the command line and the configuration do not say.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "cli/Session.h"

namespace cli {

/// One stored override that makes a difference.
struct ActiveOverride {
    std::string text;   ///< "baud 38400 instead of 9600".
    std::string words;  ///< What `override clear` takes it away by: "baud", "node 5".
};

/// @return the entries of a section that replace what the configuration says, in their order. Pure.
std::vector<ActiveOverride> activeOverrides(const std::vector<runtime::StoredEntry>& entries,
                                            std::string_view configText);

/// Complains, once, of the overrides that will be in force after the start: whose they are, what
/// they replace and how to be rid of them.
void announceOverrides(CommandContext& context, Session& session, const LineOptions& options);

}  // namespace cli
