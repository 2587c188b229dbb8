// Configuration texts and what the driver says to them.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "mrtu/Params.h"

namespace driver_test {

inline const std::string kLine =
    " uart=com1 baudrate=9600 parity=none bits=8 stopbits=1 mode=RS-232 defNodeId=1";

/// Parses items in front of a complete line configuration; "" on success, else the message.
inline std::string parse(_MRTU::ParamManager& params, const std::string& items) {
    return params.parse(("CfgVer=1 " + items + kLine).c_str()) ? "" : params.getLastError();
}

inline std::string messageFor(const std::string& items) {
    _MRTU::ParamManager params;
    return parse(params, items);
}

/// The message for a text that stands alone.
inline std::string messageForWhole(const std::string& text) {
    _MRTU::ParamManager params;
    return params.parse(text.c_str()) ? "" : params.getLastError();
}

}  // namespace driver_test
