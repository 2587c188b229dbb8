// Block reads of the engine.
#include <cstring>

#include "engine/Blocks.h"
#include "engine/Footprint.h"
#include "engine/ImageBuffer.h"
#include "engine/ProtgenProtocol.h"
#include "framework/BitUtils.h"

int ProtgenProtocol::ReadBlock(const ITag* tag, unsigned char* data, int length) {
    const ProtgenTag& source = *static_cast<const ProtgenTag*>(tag);
    if (source.inBitMemory()) return readBits(source, data, engine::bitsOfBlock(source, length));

    const int itemLength = source.memoryItemLength();
    const int items = length / itemLength + (length % itemLength > 0 ? 1 : 0);
    if (refuse(engine::accessFault(source, items, false))) return 0;
    const bool whole = length % itemLength == 0;
    if (whole && items <= requestLimit(source, items, false)) {
        return readItems(source, source.offset(), data, items) ? 1 : 0;
    }
    // A later block may fail, and the last item may be longer than the caller's buffer.
    ImageBuffer image(items * itemLength);
    if (image.data() == nullptr) return fail(-1, "Out of memory");
    if (!readItems(source, source.offset(), image.data(), items)) return 0;
    std::memcpy(data, image.data(), static_cast<std::size_t>(length));
    return 1;
}

int ProtgenProtocol::ReadBitBlock(const ITag* tag, unsigned char* data, int bits) {
    const ProtgenTag& source = *static_cast<const ProtgenTag*>(tag);
    if (!source.inBitMemory()) return fail(-3, "Bit blocks not supported");
    return readBits(source, data, bits);
}

int ProtgenProtocol::readBits(const ProtgenTag& tag, unsigned char* data, std::int64_t count) {
    if (refuse(engine::accessFault(tag, count, false))) return 0;
    const int bits = static_cast<int>(count);
    if (bits <= requestLimit(tag, bits, false)) {
        return readItems(tag, tag.offset(), data, bits) ? 1 : 0;
    }
    const int lead = tag.GetBitIndex();
    ImageBuffer image(ProtUtilsN::GetLenOfBits(lead, bits));
    if (image.data() == nullptr) return fail(-1, "Out of memory");
    if (!readItems(tag, tag.offset(), image.data(), bits)) return 0;
    ProtUtilsN::CopyBits(data, image.data(), lead, bits);
    return 1;
}

bool ProtgenProtocol::readItems(const ProtgenTag& tag, int address, unsigned char* data,
                                int count) {
    for (const Blocks::Block block : Blocks(count, requestLimit(tag, count, false))) {
        const int index = address + block.first;
        const int byte = engine::byteOfItem(tag, address, block.first);
        const bool done = tag.inBitMemory() ? doReadBits(&tag, index, data + byte, block.count)
                                            : doReadBlock(&tag, index, data + byte, block.count);
        if (!done) return false;
    }
    return true;
}
