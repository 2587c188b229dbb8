// Writes of the device's areas.
#include "framework/BitUtils.h"
#include "framework/DataTypes.h"
#include "mrtu/LineLock.h"
#include "mrtu/Tag_MRTU.h"

using _MRTU::Fault;
using _MRTU::Message;
using _MRTU::Reply;

namespace {

bool bitOf(const unsigned char* data, int index) {
    return (data[0] >> (static_cast<unsigned>(index) % 8u) & 1u) != 0;
}

std::uint8_t low(long long value) {
    return static_cast<std::uint8_t>(value & 0xFF);
}

/// Count and byte count, which the requests for several items carry in front of their data.
void putCounts(Message& request, bool bits, int count) {
    request.putWord(static_cast<std::uint16_t>(static_cast<unsigned>(count) & 0xFFFFu));
    request.put(low(bits ? (static_cast<long long>(count) + 7) / 8 : 2LL * count));
}

void putCoil(Message& request, bool on) {
    request.putWord(on ? 0xFF00 : 0x0000);
}

bool putBits(Message& request, const unsigned char* data, int index, int count) {
    const long long length = (static_cast<long long>(count) + 7) / 8;
    if (count < 0 || !request.fits(length)) return false;
    ProtUtilsN::shiftBits(request.extend(static_cast<int>(length)), 0, data, index % 8, count);
    return true;
}

/// Host items, each most significant byte first.
bool putItems(Message& request, const unsigned char* data, int count, int itemLength) {
    if (count < 0 || !request.fits(static_cast<long long>(count) * itemLength)) return false;
    _MRTU::turnItems(request.extend(count * itemLength), data, count, itemLength);
    return true;
}

}  // namespace

int Protocol_MRTU::doWrite(const ProtgenTag* tag, int index, const unsigned char* data, int count) {
    return guardedBy(0,
                     [&] { return write(*static_cast<const Tag_MRTU*>(tag), index, data, count); });
}

int Protocol_MRTU::write(const Tag_MRTU& own, int index, const unsigned char* data, int count) {
    if (!started_) return fail(_MRTU::kNotStarted);
    if (own.driverArea() != _MRTU::DriverArea::None) return writeDriverArea(own, data) ? 1 : 0;
    if (!_MRTU::isSingleWrite(own.writeFunction())) return writeItems(&own, index, data, count);

    // One request for each item. Coils all look at the same first byte, each at the bit of its own
    // number; registers walk through the data.
    const int step = own.writeFunction() == _MRTU::kWriteCoil ? 0 : own.memoryItemLength();
    for (int item = 0; item < count; ++item, data += step)
        if (writeItems(&own, index + item, data, 1) == 0) return 0;
    return 1;
}

int Protocol_MRTU::doWriteBits(const ProtgenTag* tag, int index, const unsigned char* data,
                               int count) {
    return doWrite(tag, index, data, count);
}

/// One transaction: builds, sends and checks one request.
int Protocol_MRTU::writeItems(const Tag_MRTU* tag, int index, const unsigned char* data,
                              int count) {
    if (tag->writeFunction() == 0) return fail(_MRTU::kReadOnly);
    pauseBefore(*tag);
    const LineLock lock(*this);
    if (const Fault fault = writeRequest(*tag, index, data, count)) return fail(fault);
    return 1;
}

Fault Protocol_MRTU::writeRequest(const Tag_MRTU& tag, int index, const unsigned char* data,
                                  int count) {
    const bool bits = tag.inBitMemory();
    const std::uint8_t function = tag.writeFunction();
    Message request;
    if (const Fault fault = beginRequest(tag, function, index, request)) return fault;
    if (!_MRTU::isSingleWrite(function)) putCounts(request, bits, count);

    bool complete = true;
    if (!bits)
        complete = putItems(request, data, count, tag.memoryItemLength());
    else if (function == _MRTU::kWriteCoil)
        putCoil(request, bitOf(data, index));
    else
        complete = putBits(request, data, index, count);
    if (!complete) return _MRTU::kTooMany;

    Reply reply;
    exchange(tag, request, reply);
    constexpr int kNoData = 0;
    return _MRTU::checkReply(request, reply, kNoData);
}
