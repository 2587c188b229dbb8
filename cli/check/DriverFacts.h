// What a driver says of a tag when it is asked.
#pragma once

#include <optional>
#include <string>

#include "lint/TagLines.h"
#include "platform/IProtocol.h"

namespace cli {

/// Lets the driver make the tag and try its conversions on a value; the tag is freed again.
/// @return nothing, with the driver's message in `refusal`, when it refuses the tag.
std::optional<lint::TagFacts> factsOf(IProtocol& protocol, const std::string& uri,
                                      std::string& refusal);

}  // namespace cli
