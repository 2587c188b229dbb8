// A description as tables for a person. Pure.
#pragma once

#include <cstdint>
#include <string>

#include "cli/describe/Description.h"

namespace cli {

/// What a configuration may say, with defaults and choices.
std::string parametersText(const Description& description);
/// What each model offers.
std::string modelsText(const Description& description);
/// The areas with their data types and the limits of one request.
std::string memoryText(const Description& description);
std::string conversionsText(const Description& description);
/// All of them behind a few lines on the driver and on tag addresses.
std::string descriptionText(const Description& description);

/// @return the data types of a mask, e.g. "boolean, boolean-"; where most are in it, "all but ...".
std::string typesText(std::uint32_t mask);

}  // namespace cli
