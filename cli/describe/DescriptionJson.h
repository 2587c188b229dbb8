// A description as JSON. Pure.
#pragma once

#include "settings/DriverDescription.h"
#include "values/JsonValues.h"

namespace cli {

/// Data types are lists of their names; what a parameter does not have is left out.
values::Json parametersJson(const settings::Description& description);
values::Json modelsJson(const settings::Description& description);
values::Json memoryJson(const settings::Description& description);
values::Json conversionsJson(const settings::Description& description);
/// An object with the members facts, parameters, memory, tagFields, models and conversions.
values::Json descriptionJson(const settings::Description& description);

}  // namespace cli
