// What a reply must look like: pure checks, each list read top to bottom, first failure wins.
#pragma once

#include <cstdint>

#include "mrtu/Frame.h"

namespace _MRTU {

/// A failure as the protocol reports it; code 0 is success.
struct Fault {
    int code = 0;
    const char* text = "";

    explicit operator bool() const { return code != 0; }
};

inline constexpr Fault kNoFault{};
inline constexpr Fault kCannotOpen{-1, "Can't open serial port"};
inline constexpr Fault kNotStarted{-3, "Protocol not started"};
inline constexpr Fault kNoResponse{-4, "No response"};
inline constexpr Fault kTooShort{-6, "The received message too short"};
inline constexpr Fault kChecksum{-6, "Incorrect response checksum"};
inline constexpr Fault kNode{-6, "Incorrect node address in response"};
inline constexpr Fault kOperation{-6, "Incorrect operation in response"};
inline constexpr Fault kDataLength{-6, "Incorrect data length received"};
inline constexpr Fault kOffset{-6, "Incorrect offset in response"};
inline constexpr Fault kCount{-6, "Incorrect count in response"};
inline constexpr Fault kAcknowledge{-6, "Incorrect writing data acknowledge"};
inline constexpr Fault kNodeDisabled{-10, "Node disabled"};
inline constexpr Fault kBroadcast{-10, "Broadcast request"};

/// An accepted frame. The buffer is zero when an exchange begins, and every frame of the exchange,
/// good or bad, is laid over the one before: a check of a field that a short frame lacks compares
/// with zero, or with what a longer frame of an earlier attempt left there.
struct Reply {
    std::array<std::uint8_t, kMaxFrame> bytes{};
    int length = 0;       ///< Bytes of the frame, check included; may exceed the buffer.
    int checkLength = 0;  ///< 2 for a CRC, 1 for an LRC.
};

/// Node, exception, function.
Fault checkCommon(const Message& request, const Reply& reply);

/// Length of the frame and byte count, for `dataLength` bytes of data.
Fault checkReadBody(const Reply& reply, long long dataLength);

/// Start address, and echoed value (functions 5 and 6) or count (15 and 16).
Fault checkWriteBody(const Message& request, const Reply& reply);

}  // namespace _MRTU
