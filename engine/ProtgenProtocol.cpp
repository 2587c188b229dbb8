// What the engine answers about tags, and what reads and writes share.
#include "engine/ProtgenProtocol.h"

#include "engine/Footprint.h"
#include "framework/DataTypes.h"

namespace {

const ProtgenTag& own(const ITag* tag) {
    return *static_cast<const ProtgenTag*>(tag);
}

bool sameDevice(const ProtgenTag& a, const ProtgenTag& b) {
    return a.nodeId() == b.nodeId() && a.model() == b.model();
}

bool inDatagram(const ProtgenTag& tag) {
    return tag.memoryType() != nullptr && tag.memoryType()->isInDatagram();
}

// The tag's first bit within its first item.
int bitInItem(const ProtgenTag& tag) {
    const bool counts = !tag.inBitMemory() && ProtUtilsN::IsBitType(tag.GetVarType());
    return counts ? tag.subIndex() : 0;
}

// The first bit of the tag, counted from address 0 of its memory.
std::int64_t firstBit(const ProtgenTag& tag) {
    const std::int64_t itemBits = tag.inBitMemory() ? 1 : tag.memoryItemLength() * 8;
    return tag.offset() * itemBits + bitInItem(tag);
}

// The bit behind the tag's last one.
std::int64_t endBit(const ProtgenTag& tag) {
    const std::int64_t length = tag.GetVarLength();
    return firstBit(tag) + (ProtUtilsN::IsBitType(tag.GetVarType()) ? length : length * 8);
}

// Two bits that touch do not do: a sub-index beyond the first item makes the images overlap.
bool imagesFitTogether(const ProtgenTag& first, const ProtgenTag& next) {
    return next.offset() == first.offset() || bitInItem(next) == 0;
}

bool adjacent(const ITag* a, const ITag* b) {
    const ProtgenTag& next = own(a);
    const ProtgenTag& first = own(b);
    return next.memoryType() == first.memoryType() && sameDevice(next, first) &&
           endBit(first) == firstBit(next) && imagesFitTogether(first, next);
}

const char* accessFault(const ProtgenTag& tag, bool write) {
    return engine::accessFault(tag, engine::itemsOfTag(tag), write);
}

const char* readFault(const ITag* tag) {
    return accessFault(own(tag), false);
}

}  // namespace

ProtgenProtocol::ProtgenProtocol() {
    readCheck_ = readFault;
    adjacency_ = adjacent;
}

bool ProtgenProtocol::CanBeOptimized(const ITag* a, const ITag* b, bool write) const {
    const ProtgenTag& first = own(a);
    if (first.memoryType() == nullptr || first.memoryType() != own(b).memoryType()) return false;
    if (!sameDevice(first, own(b))) return false;
    if (write && first.IsReadOnly()) return false;
    // A tag that is refused by itself would take the others of its block along.
    if (accessFault(first, write) != nullptr || accessFault(own(b), write) != nullptr) return false;
    return engine::declaredBlock(first, write) != 0;
}

bool ProtgenProtocol::IsBefore(const ITag* a, const ITag* b) const {
    // By items first: a block holds its tags' images, which begin with their first items.
    if (own(a).offset() != own(b).offset()) return own(a).offset() < own(b).offset();
    return bitInItem(own(a)) < bitInItem(own(b));
}

int ProtgenProtocol::GetNodeID(const ITag* tag) const {
    return own(tag).nodeId();
}

bool ProtgenProtocol::CanReadBitBlock(const ITag* tag) const {
    return own(tag).inBitMemory();
}

bool ProtgenProtocol::CanWriteBitBlock(const ITag* tag) const {
    return own(tag).inBitMemory() && !tag->IsReadOnly();
}

bool ProtgenProtocol::NeedsReadBeforeWrite(const ITag* tag) const {
    const ProtgenTag& target = own(tag);
    if (accessFault(target, true) != nullptr) return false;
    if (engine::declaredBlock(target, true) == 0) return false;
    return engine::footprint(target, engine::wholeTag(target)).partial;
}

int ProtgenProtocol::MaxDatagramItems(const ITag* tag) const {
    const Model* model = own(tag).model();
    return model != nullptr ? model->getMaxDatagramItems() : 0;
}

int ProtgenProtocol::MaxDatagramLength(const ITag* tag) const {
    const Model* model = own(tag).model();
    return model != nullptr ? model->getMaxDatagramLength() : 0;
}

bool ProtgenProtocol::CanCoexistInDatagram(const ITag* a, const ITag* b) const {
    return inDatagram(own(a)) && inDatagram(own(b)) && sameDevice(own(a), own(b));
}

bool ProtgenProtocol::CanAddToDatagram(const ITag* const* tags, int count, const ITag* candidate) {
    return ProtocolBase::CanAddToDatagram(tags, count, candidate);
}

int ProtgenProtocol::getMaxBitCount(const ProtgenTag* tag, bool write) const {
    return getMaxItemCount(tag, write);
}

int ProtgenProtocol::arrayItemByTag() const {
    return 0;
}

int ProtgenProtocol::requestLimit(const ProtgenTag& tag, int count, bool write) const {
    const int limit =
        tag.inBitMemory() ? getMaxBitCount(&tag, write) : getMaxItemCount(&tag, write);
    if (limit > 0) return limit;
    // An area of the driver itself is one value that is never cut. Any other area was lowered to
    // less than an item by the configuration: item by item is the nearest that works.
    return engine::declaredBlock(tag, write) == 0 ? count : 1;
}

int ProtgenProtocol::fail(int code, const char* text) {
    SetError(code, text);
    return 0;
}
