// What a driver accepts in a configuration without a word, although it was hardly meant. Pure.
#pragma once

#include "lint/Finding.h"
#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace lint {

/// Rules: ignored-text, not-an-item, unknown-key, duplicate-key, ignored-node, ignored-key,
/// octal-number, not-a-number, out-of-range, unlisted-value, unknown-model.
/// @return warnings only, in the order of the text.
Findings lintConfig(const settings::ScannedConfig& config,
                    const settings::Description& description);

/// Makes the driver's refusal of a configuration an error at the item that its message names in
/// single quotes, with what the description knows about that key.
Finding configRefusal(const settings::ScannedConfig& config,
                      const settings::Description& description, const std::string& message);

}  // namespace lint
