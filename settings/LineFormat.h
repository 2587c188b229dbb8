// How characters travel on the line of a configuration. Pure.
#pragma once

#include "settings/ConfigScan.h"
#include "wire/Bytes.h"
#include "wire/Times.h"

namespace settings {

struct LineFormat {
    wire::Mode mode;
    wire::LineRate rate;  ///< 0 baud where the configuration names none.
};

LineFormat lineFormatOf(const ScannedConfig& config);

}  // namespace settings
