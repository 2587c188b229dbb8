// A description as JSON. Pure.
#pragma once

#include "cli/describe/Description.h"
#include "values/JsonValues.h"

namespace cli {

/// Data types are lists of their names; what a parameter does not have is left out.
values::Json parametersJson(const Description& description);
values::Json modelsJson(const Description& description);
values::Json memoryJson(const Description& description);
values::Json conversionsJson(const Description& description);
/// An object with the members facts, parameters, memory, tagFields, models and conversions.
values::Json descriptionJson(const Description& description);

}  // namespace cli
