// Which memory items hold a tag, or a part of it.
#include "engine/Footprint.h"

#include <algorithm>
#include <string>
#include <string_view>

#include "framework/DataTypes.h"
#include "framework/Swaps.h"

namespace engine {

namespace {

// Items change places within groups that begin at multiples of the widest swap; the narrower groups
// lie inside the wider ones.
int widestSwap(const ProtgenTag& tag) {
    int width = 1;
    for (const std::string& name : tag.conversions()) {
        for (const ProtUtilsN::Swap& row : ProtUtilsN::kSwaps) {
            if (row.name == name) width = std::max(width, row.width);
        }
    }
    return width;
}

int itemBits(const ProtgenTag& tag) {
    return tag.memoryItemLength() * 8;
}

// No bit number of a tag in an area of so many items leaves the range of an int.
constexpr std::int64_t kMostItems = std::int64_t{1} << 24;

bool insideArea(const ProtgenTag& tag, std::int64_t items, bool write) {
    if (tag.offset() < 0 || tag.offset() + items > kMostItems) return false;
    if (declaredBlock(tag, write) == 0) return true;
    const MemoryType& area = *tag.memoryType();
    const std::int64_t size = std::int64_t{area.getMaxIndex()} - area.getMinIndex() + 1;
    return tag.offset() + items <= size;
}

// The bits by which the image's first bit lies in front of the tag's offset.
int lead(const ProtgenTag& tag) {
    return tag.inBitMemory() ? tag.GetBitIndex() : 0;
}

}  // namespace

int declaredBlock(const ProtgenTag& tag, bool write) {
    const MemoryType& area = *tag.memoryType();
    return write ? area.getBlockWriteCount() : area.getBlockReadCount();
}

std::int64_t itemsOfTag(const ProtgenTag& tag) {
    const std::int64_t length = tag.GetVarLength();
    if (length <= 0) return 0;
    const bool bits = ProtUtilsN::IsBitType(tag.GetVarType());
    if (tag.inBitMemory()) return bits ? length : length * 8;
    const std::int64_t end = bits ? tag.GetBitIndex() + length : length * 8;
    return (end + itemBits(tag) - 1) / itemBits(tag);
}

const char* accessFault(const ProtgenTag& tag, std::int64_t items, bool write) {
    if (tag.memoryType() == nullptr) return "Tag has no memory type";
    const bool bits = ProtUtilsN::IsBitType(tag.GetVarType());
    if (bits && tag.subIndex() < 0) return "Tag's bit index is negative";
    if (items <= 0) return "Tag length is not positive";
    if (!insideArea(tag, items, write)) return "Tag exceeds the memory area";
    if (!bits && lead(tag) != 0) return "Only bits may begin inside a byte";
    return nullptr;
}

std::int64_t bitsOfBlock(const ProtgenTag& tag, int length) {
    const bool bits = ProtUtilsN::IsBitType(tag.GetVarType());
    if (bits && length == tag.PackedLen()) return tag.GetVarLength();
    return std::int64_t{length} * 8 - lead(tag);
}

int byteOfItem(const ProtgenTag& tag, int address, int number) {
    if (!tag.inBitMemory()) return number * tag.memoryItemLength();
    return (address % 8 + number) / 8;
}

BitRange wholeTag(const ProtgenTag& tag) {
    if (!ProtUtilsN::IsBitType(tag.GetVarType())) return {0, tag.GetVarLength() * 8};
    return {tag.GetBitIndex(), tag.GetBitIndex() + tag.GetVarLength()};
}

BitRange arrayItem(const ProtgenTag& tag, int index) {
    const int length = ProtUtilsN::GetBasicLength(&tag);
    const int width = widestSwap(tag);
    const int begin = index * length / width * width;
    const int end = ((index + 1) * length + width - 1) / width * width;
    const int last = std::min(end, tag.GetVarLength());
    if (!ProtUtilsN::IsBitType(tag.GetVarType())) return {begin * 8, last * 8};
    return {tag.GetBitIndex() + begin, tag.GetBitIndex() + last};
}

Footprint footprint(const ProtgenTag& tag, const BitRange& range) {
    if (tag.inBitMemory()) {
        const int firstByte = range.begin / 8;
        return {.address = tag.offset() - lead(tag) + range.begin,
                .count = range.size(),
                .firstBit = firstByte * 8,
                .bytes = (range.end + 7) / 8 - firstByte,
                .partial = false};
    }
    const int bits = itemBits(tag);
    const int first = range.begin / bits;
    const int count = (range.end + bits - 1) / bits - first;
    return {.address = tag.offset() + first,
            .count = count,
            .firstBit = first * bits,
            .bytes = count * tag.memoryItemLength(),
            .partial = range.begin % bits != 0 || range.end % bits != 0};
}

}  // namespace engine
