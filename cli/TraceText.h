// Frames on the line as text. Pure.
#pragma once

#include <string>

#include "cli/Bytes.h"
#include "runtime/TracingSerialFactory.h"

namespace cli {

/// @return the bytes as two upper-case hexadecimal digits each, separated by blanks.
std::string hexText(ByteView bytes);

/// @return one line without its end: local time of day, port, ">" (sent) or "<" (received), bytes.
/// `14:03:07.123 com1 > 01 03 00 00 00 01 84 0A`; a frame that was cut short ends in " (cut)".
std::string traceText(const runtime::TraceEvent& event);

}  // namespace cli
