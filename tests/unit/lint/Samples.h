// A small driver family member for the rules to look at: its description and tags it accepted.
#pragma once

#include <string>

#include "lint/Finding.h"
#include "lint/TagLines.h"
#include "settings/DriverDescription.h"

namespace lint {

/// Keys, two models, coils, holding registers, read-only registers and 32-bit registers.
const settings::Description& sampleDescription();

/// A tag that the driver accepted on node 1.
/// @param byteOffset, bitIndex  As ITag reports them.
TagLine acceptedTag(const std::string& uri, int line, unsigned byteOffset, int bitIndex,
                    ICU_Type type, int length, ICU_Type itemType = ICU_Type::none);

/// "rule@line:column" of every finding, separated by blanks.
std::string placesOf(const Findings& findings);

}  // namespace lint
