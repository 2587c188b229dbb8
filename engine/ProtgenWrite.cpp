// Writes of the engine.
#include <cstring>

#include "engine/Blocks.h"
#include "engine/Footprint.h"
#include "engine/ImageBuffer.h"
#include "engine/ProtgenProtocol.h"
#include "engine/WriteTurn.h"

using engine::WriteTurn;

int ProtgenProtocol::Write(const ITag* tag, const unsigned char* value) {
    const ProtgenTag& target = *static_cast<const ProtgenTag*>(tag);
    if (refuseWrite(target, engine::itemsOfTag(target))) return 0;
    const engine::Footprint place = engine::footprint(target, engine::wholeTag(target));
    ImageBuffer image(place.firstByte() + place.bytes);
    if (image.data() == nullptr) return fail(-1, "Out of memory");
    unsigned char* items = image.data() + place.firstByte();

    const WriteTurn turn(writeTurns_, target, place.partial ? WriteTurn::Change : WriteTurn::Free);
    const bool readFirst = place.partial && engine::declaredBlock(target, true) != 0;
    if (readFirst && !readItems(target, place.address, items, place.count)) return 0;
    if (!target.ConvertVariable(value, image.data(), true)) {
        return conversionFailed(tag, "write conversion error");
    }
    return writeItems(target, place.address, items, place.count) ? 1 : 0;
}

int ProtgenProtocol::WriteBlock(const ITag* tag, const unsigned char* data, int length) {
    const ProtgenTag& target = *static_cast<const ProtgenTag*>(tag);
    if (target.inBitMemory()) return writeBits(target, data, engine::bitsOfBlock(target, length));

    const int itemLength = target.memoryItemLength();
    const int items = length / itemLength + (length % itemLength > 0 ? 1 : 0);
    if (refuseWrite(target, items)) return 0;
    if (length % itemLength == 0) return writeItems(target, target.offset(), data, items) ? 1 : 0;
    ImageBuffer image(items * itemLength);
    if (image.data() == nullptr) return fail(-1, "Out of memory");

    const WriteTurn turn(writeTurns_, target, WriteTurn::Change);
    const bool readFirst = engine::declaredBlock(target, true) != 0;
    if (readFirst && !readItems(target, target.offset(), image.data(), items)) return 0;
    std::memcpy(image.data(), data, static_cast<std::size_t>(length));
    return writeItems(target, target.offset(), image.data(), items) ? 1 : 0;
}

int ProtgenProtocol::WriteBitBlock(const ITag* tag, const unsigned char* data, int bits) {
    const ProtgenTag& target = *static_cast<const ProtgenTag*>(tag);
    if (!target.inBitMemory()) return fail(-3, "Bit blocks not supported");
    return writeBits(target, data, bits);
}

int ProtgenProtocol::writeBits(const ProtgenTag& tag, const unsigned char* data,
                               std::int64_t count) {
    if (refuseWrite(tag, count)) return 0;
    return writeItems(tag, tag.offset(), data, static_cast<int>(count)) ? 1 : 0;
}

bool ProtgenProtocol::writeItems(const ProtgenTag& tag, int address, const unsigned char* data,
                                 int count) {
    for (const Blocks::Block block : Blocks(count, requestLimit(tag, count, true))) {
        const int index = address + block.first;
        const int byte = engine::byteOfItem(tag, address, block.first);
        const WriteTurn turn(writeTurns_, tag, WriteTurn::Request);
        const int done = tag.inBitMemory() ? doWriteBits(&tag, index, data + byte, block.count)
                                           : doWrite(&tag, index, data + byte, block.count);
        if (done == 0) return false;
    }
    return true;
}

bool ProtgenProtocol::refuseWrite(const ProtgenTag& tag, std::int64_t items) {
    if (tag.IsReadOnly()) return refuse("Memory type is read only");
    return refuse(engine::accessFault(tag, items, true));
}

bool ProtgenProtocol::refuse(const char* fault) {
    if (fault != nullptr) SetError(-1, fault);
    return fault != nullptr;
}
