// A description as tables for a person. Pure.
#pragma once

#include <string>

#include "settings/DriverDescription.h"

namespace cli {

/// What a configuration may say, with defaults and choices.
std::string parametersText(const settings::Description& description);
/// What each model offers.
std::string modelsText(const settings::Description& description);
/// The areas with their data types and the limits of one request.
std::string memoryText(const settings::Description& description);
std::string conversionsText(const settings::Description& description);
/// All of them behind a few lines on the driver and on tag addresses.
std::string descriptionText(const settings::Description& description);

}  // namespace cli
