// Which bytes answer which request, told by the two frames alone. Pure, and nothing here takes
// memory, since it is asked in every transaction.
//
// A good reply to a read of holding registers has two bytes for each, or four where they are the
// 32-bit registers of an Enron device: the request does not tell them apart, so both are right.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>

#include "wire/Bytes.h"
#include "wire/FunctionCodes.h"

namespace wire {

/// What a request's frame says about its reply.
struct Request {
    Mode mode = Mode::Rtu;
    std::uint8_t node = 0;
    std::uint8_t function = 0;
    /// Null for a function that is none of kFunctions, and for a request that is not laid out as
    /// its function demands: little can be told about the reply then.
    const FunctionRow* row = nullptr;
    /// The first bytes behind the function: address, then count or value (up to 32 bits).
    std::array<std::uint8_t, 2 + kLongRegisterBytes> fields{};
    std::size_t fieldCount = 0;

    /// Nobody answers a broadcast.
    bool isBroadcast() const { return node == 0; }
    /// Items that a read asks for.
    std::size_t count() const { return static_cast<std::size_t>(fields[2] << 8U | fields[3]); }
};

/// Reads a request as it travels. It is an ASCII frame when it is a whole one in all its parts,
/// else an RTU frame.
/// @return nothing when it is neither.
std::optional<Request> requestIn(ByteView frame);

/// The same for a frame of which requestIn() has made a request before: the CRC, which costs more
/// than all the rest, is not reckoned again. Of another frame it makes a request that means
/// nothing.
std::optional<Request> knownRequestIn(ByteView frame);

/// @param received  What has come of the reply so far, also nothing.
/// @return how long the reply's frame is at least: exactly so long once its third byte is there.
/// 0 when nobody answers, when `received` is no reply's beginning, or when the request's row is
/// null.
std::size_t replyLength(const Request& request, ByteView received);

enum class Answering : std::uint8_t {
    No,
    Damaged,  ///< As long as a good reply, but damaged on its way.
    Yes,      ///< Node, function or exception, announced and asked length, echo and check agree.
};

/// Whether a frame is a reply to the request, perhaps an exception. Without a row, node, function
/// and check decide alone.
Answering answering(const Request& request, ByteView frame);

/// Whether nothing more of a reply can follow. RTU: the bytes are exactly a right reply, never
/// without a row. ASCII: a colon first, CR and LF last.
bool isWholeReply(const Request& request, ByteView received);

/// Whether a good reply to the one could be taken for a good reply to the other, by node, function
/// and length, and for a write by the address and the count (or the first two bytes of the value)
/// that come back. Reads of holding registers may be meant for long ones, so counts that differ by
/// a power of two count as the same length. Both ways round the same, and among requests with a
/// row one that can be confused with two others makes these two count as such too. Exceptions are
/// left out.
bool confusable(const Request& one, const Request& other);

}  // namespace wire
