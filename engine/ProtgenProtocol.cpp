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

// The first bit of the tag, counted from address 0 of its memory.
std::int64_t firstBit(const ProtgenTag& tag) {
    if (tag.inBitMemory()) return tag.offset();
    const bool bits = ProtUtilsN::IsBitType(tag.GetVarType());
    return std::int64_t{tag.offset()} * tag.memoryItemLength() * 8 + (bits ? tag.subIndex() : 0);
}

const char* readFault(const ITag* tag) {
    return engine::accessFault(own(tag), engine::itemsOfTag(own(tag)), false);
}

}  // namespace

ProtgenProtocol::ProtgenProtocol() {
    readCheck_ = readFault;
}

bool ProtgenProtocol::CanBeOptimized(const ITag* a, const ITag* b, bool write) const {
    const ProtgenTag& first = own(a);
    if (first.memoryType() == nullptr || first.memoryType() != own(b).memoryType()) return false;
    if (!sameDevice(first, own(b))) return false;
    if (write && first.IsReadOnly()) return false;
    return engine::declaredBlock(first, write) != 0;
}

bool ProtgenProtocol::IsBefore(const ITag* a, const ITag* b) const {
    return firstBit(own(a)) < firstBit(own(b));
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
    if (engine::accessFault(target, engine::itemsOfTag(target), true) != nullptr) return false;
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
