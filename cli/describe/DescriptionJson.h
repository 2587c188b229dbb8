// A description as JSON. Pure.
#pragma once

#include "cli/JsonValues.h"
#include "cli/describe/Description.h"

namespace cli {

/// Data types are lists of their names; what a parameter does not have is left out.
Json parametersJson(const Description& description);
Json modelsJson(const Description& description);
Json memoryJson(const Description& description);
Json conversionsJson(const Description& description);
/// An object with the members facts, parameters, memory, tagFields, models and conversions.
Json descriptionJson(const Description& description);

}  // namespace cli
