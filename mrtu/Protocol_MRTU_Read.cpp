// Reads of the device's areas.
#include <algorithm>

#include "framework/BitUtils.h"
#include "framework/DataTypes.h"
#include "mrtu/LineLock.h"
#include "mrtu/Tag_MRTU.h"

using _MRTU::Fault;
using _MRTU::Message;
using _MRTU::Reply;

namespace {

constexpr std::size_t kDataStart = 1 + 1 + 1;  // node, function, byte count

}  // namespace

int Protocol_MRTU::getMaxItemCount(const ProtgenTag* tag, bool write) const {
    const MemoryType& memory = *tag->memoryType();
    const _MRTU::NodeParams& node = *static_cast<const Tag_MRTU*>(tag)->nodeParams();
    const int blockLimit = write ? memory.getBlockWriteCount() : memory.getBlockReadCount();
    if (ProtUtilsN::IsBitType(memory.getNaturalType()))
        return std::min(node.maxBitOptLen, blockLimit);
    const int itemLength = ProtUtilsN::GetDataLength(memory.getNaturalType());
    return std::min(node.maxOptLen / itemLength, blockLimit);
}

bool Protocol_MRTU::doReadBlock(const ProtgenTag* tag, int index, unsigned char* data, int count) {
    if (!started_) return fail(_MRTU::kNotStarted) != 0;
    const Tag_MRTU& own = *static_cast<const Tag_MRTU*>(tag);
    return guardedBy(false, [&] {
        if (own.driverArea() != _MRTU::DriverArea::None) {
            readDriverArea(own, data);
            return true;
        }
        pauseBefore(own);
        const LineLock lock(*this);
        if (const Fault fault = readItems(own, index, data, count)) return fail(fault) != 0;
        return true;
    });
}

bool Protocol_MRTU::doReadBits(const ProtgenTag* tag, int index, unsigned char* data, int count) {
    return doReadBlock(tag, index, data, count);
}

/// One read request. `data` is stored only after every check has passed.
Fault Protocol_MRTU::readItems(const Tag_MRTU& tag, int index, unsigned char* data, int count) {
    Message request;
    if (const Fault fault = beginRequest(tag, tag.readFunction(), index, request)) return fault;
    request.putWord(static_cast<std::uint16_t>(static_cast<unsigned>(count) & 0xFFFFu));

    Reply reply;
    exchange(tag, request, reply);

    const ICU_Type natural = tag.memoryType()->getNaturalType();
    const bool bits = ProtUtilsN::IsBitType(natural);
    const int itemLength = ProtUtilsN::GetDataLength(natural);
    const long long dataLength =
        bits ? (static_cast<long long>(count) + 7) / 8 : static_cast<long long>(count) * itemLength;
    if (const Fault fault = _MRTU::checkReply(request, reply, dataLength)) return fault;

    const std::uint8_t* received = reply.bytes.data() + kDataStart;
    if (bits)
        ProtUtilsN::shiftBits(data, index % 8, received, 0, count);
    else
        _MRTU::turnItems(data, received, count, itemLength);
    return _MRTU::kNoFault;
}
