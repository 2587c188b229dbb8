// What Modbus frames on a line mean, in words. Pure: no port, no clock. Read from the standard by
// itself, not through the driver, so that a mistake of the driver's shows.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "wire/Bytes.h"

namespace wire {

/// Follows the frames of one line, since a reply says only part of what it answers. Items count
/// from 0 as on the line; values are decimal and without a sign, registers of 16 bits unless the
/// frame's length tells that they have 32.
/// Threads: one at a time.
class FrameMeaning {
  public:
    explicit FrameMeaning(Mode mode) : mode_(mode) {}

    /// @param frame  As on the line, check included.
    /// @return "node 1: read 1 holding register at 9", "all nodes: write coil at 4: on";
    /// "damaged" for what is no frame.
    std::string ofRequest(ByteView frame);

    /// @return what the answer to the last request says: "node 1: 1009", "node 1: written",
    /// "node 1: exception 2, illegal data address".
    std::string ofReply(ByteView frame) const;

  private:
    struct Request {
        std::uint8_t node;
        std::uint8_t function;
        std::size_t count;  ///< Items that it asks for; 0 when it says nothing of that.
    };

    Mode mode_;
    std::optional<Request> last_;
};

}  // namespace wire
