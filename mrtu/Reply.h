// What came for a request, and the list of checks that it has to pass.
#pragma once

#include <array>
#include <cstdint>

#include "mrtu/Frame.h"

/// @return the text for an exception code, "Unknown exception" for an unknown one.
const char* getExceptionText(unsigned char code);

namespace _MRTU {

/// A failure as the protocol reports it; code 0 is success.
struct Fault {
    int code = 0;
    const char* text = "";

    explicit operator bool() const { return code != 0; }
};

inline constexpr Fault kNoFault{};
inline constexpr Fault kCannotOpen{-1, "Can't open serial port"};
inline constexpr Fault kTooMany{-1, "Too many items for one request"};
inline constexpr Fault kNotStarted{-3, "Protocol not started"};
inline constexpr Fault kReadOnly{-3, "Memory type is read only"};
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

/// What the attempts of one exchange brought. The buffer is zero when an exchange begins, and every
/// frame of the exchange, good or bad, is laid over the one before: a check of a field that a short
/// frame lacks compares with zero, or with what a longer frame of an earlier attempt left there.
struct Reply {
    std::array<std::uint8_t, kMaxFrame> bytes{};
    int length = 0;         ///< Bytes of the frame, check included; may exceed the buffer.
    int checkLength = 0;    ///< 2 for a CRC, 1 for an LRC.
    int received = 0;       ///< Bytes or characters that the last attempt brought.
    bool accepted = false;  ///< The last attempt brought a frame whose check is right.
};

inline constexpr int kCrcLength = 2;
inline constexpr int kLrcLength = 1;

/// Takes over what an attempt received, good or bad: after the last attempt the bytes are looked at
/// again. Frames too short to be one leave the buffer alone.
/// @return whether it is a good frame.
bool acceptRtu(ByteView received, Reply& reply);
bool acceptAscii(ByteView received, Reply& reply);

/// The one list of what a reply must look like, after the last attempt.
/// @param dataLength  Bytes of data that a read asked for; of no meaning for a write.
/// @return the first check that fails, or kNoFault.
Fault checkReply(const Message& request, const Reply& reply, long long dataLength);

}  // namespace _MRTU
