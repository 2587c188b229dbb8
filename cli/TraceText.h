// Frames on the line as text. Pure.
#pragma once

#include <map>
#include <string>

#include "runtime/TracingSerialFactory.h"
#include "values/LittleEndian.h"
#include "wire/FrameMeaning.h"

namespace cli {

/// How frames are shown.
struct TraceStyle {
    bool ascii = false;    ///< The line's frames are ASCII ones, shown as their characters ...
    bool hex = false;      ///< ... unless their bytes are wanted.
    bool meaning = false;  ///< Says also what a frame means.
};

/// Shows frames in the order of their passing.
class TraceText {
  public:
    explicit TraceText(TraceStyle style) : style_(style) {}

    /// @return one line without its end: local time of day, port, ">" (sent) or "<" (received), the
    /// frame. `14:03:07.123 com1 > 01 03 00 00 00 01 84 0A`; a frame that was cut short ends in
    /// " (cut)", one that the port threw away in " (late, thrown away)", any other with its meaning
    /// where that is wanted: ` | node 1: read 1 holding register at 0`.
    std::string lineOf(const runtime::TraceEvent& event);

  private:
    std::string endOf(const runtime::TraceEvent& event);
    std::string frameOf(values::ByteView bytes) const;
    std::string meaningOf(const runtime::TraceEvent& event);

    TraceStyle style_;
    std::map<std::string, wire::FrameMeaning> ports_;
};

}  // namespace cli
