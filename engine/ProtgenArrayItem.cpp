// Single items of array tags: only the memory items that hold them travel.
#include <cstring>

#include "engine/Footprint.h"
#include "engine/ImageBuffer.h"
#include "engine/ProtgenProtocol.h"
#include "engine/WriteTurn.h"
#include "framework/BitUtils.h"
#include "framework/DataTypes.h"

using engine::WriteTurn;

namespace {

// One item of an array on its way between the memory and the application. It is converted inside
// images of the whole array, since a conversion may depend on the item's place; the images hold
// nothing but the item's group, the items that swaps exchange it with.
class ItemImage {
  public:
    ItemImage(const ProtgenTag& tag, int index)
        : tag_(tag),
          length_(ProtUtilsN::GetBasicLength(&tag)),
          start_(index * length_),
          group_(engine::arrayItem(tag, index)),
          place_(engine::footprint(tag, group_)),
          items_(place_.bytes),
          device_(tag.PackedLen()),
          runTime_(tag.GetVarLength()) {}

    // Whether there was memory for all buffers.
    bool complete() {
        return items_.data() != nullptr && device_.data() != nullptr && runTime_.data() != nullptr;
    }
    const engine::Footprint& place() const { return place_; }
    unsigned char* items() { return items_.data(); }
    int length() const { return length_; }
    // The item in run-time form.
    unsigned char* value() { return runTime_.data() + start_; }

    bool hasPartners() const {
        return group_.size() > (ProtUtilsN::IsBitType(&tag_) ? length_ : length_ * 8);
    }
    bool toRunTime() {
        ProtUtilsN::shiftBits(device_.data(), group_.begin, items_.data(), bitInItems(),
                              group_.size());
        return tag_.ConvertVariable(device_.data(), runTime_.data(), false);
    }
    bool toItems() {
        if (!tag_.ConvertVariable(runTime_.data(), device_.data(), true)) return false;
        ProtUtilsN::shiftBits(items_.data(), bitInItems(), device_.data(), group_.begin,
                              group_.size());
        return true;
    }

  private:
    int bitInItems() const { return group_.begin - place_.firstBit; }

    const ProtgenTag& tag_;
    int length_;
    int start_;
    engine::BitRange group_;
    engine::Footprint place_;
    ImageBuffer items_;
    ImageBuffer device_;
    ImageBuffer runTime_;
};

}  // namespace

int ProtgenProtocol::readArrayItem(const ITag* tag, int index, unsigned char* value) {
    const ProtgenTag& source = *static_cast<const ProtgenTag*>(tag);
    if (!itemsAreAddressed(source, false)) return ProtocolBase::readArrayItem(tag, index, value);
    if (!arrayItemInRange(tag, index)) return 0;
    if (refuse(engine::accessFault(source, engine::itemsOfTag(source), false))) return 0;

    ItemImage image(source, index);
    if (!image.complete()) return fail(-1, "Out of memory");
    const engine::Footprint& place = image.place();
    if (!readItems(source, place.address, image.items(), place.count)) return 0;
    if (!image.toRunTime()) return conversionFailed(tag, "read conversion error");
    std::memcpy(value, image.value(), static_cast<std::size_t>(image.length()));
    return 1;
}

int ProtgenProtocol::writeArrayItem(const ITag* tag, int index, const unsigned char* value) {
    const ProtgenTag& target = *static_cast<const ProtgenTag*>(tag);
    if (target.memoryType() == nullptr) return ProtocolBase::writeArrayItem(tag, index, value);
    if (!itemsAreAddressed(target, true)) {
        const WriteTurn turn(writeTurns_, target, WriteTurn::Change);
        return ProtocolBase::writeArrayItem(tag, index, value);
    }
    if (!arrayItemInRange(tag, index)) return 0;
    if (refuseWrite(target, engine::itemsOfTag(target))) return 0;

    ItemImage image(target, index);
    if (!image.complete()) return fail(-1, "Out of memory");
    const engine::Footprint& place = image.place();
    const bool readFirst = place.partial || image.hasPartners();

    const WriteTurn turn(writeTurns_, target, readFirst ? WriteTurn::Change : WriteTurn::Free);
    if (readFirst && !readItems(target, place.address, image.items(), place.count)) return 0;
    if (image.hasPartners() && !image.toRunTime())
        return conversionFailed(tag, "read conversion error");
    std::memcpy(image.value(), value, static_cast<std::size_t>(image.length()));
    if (!image.toItems()) return conversionFailed(tag, "write conversion error");
    return writeItems(target, place.address, image.items(), place.count) ? 1 : 0;
}

// An area of the driver itself is one value: its items cannot be reached alone.
bool ProtgenProtocol::itemsAreAddressed(const ProtgenTag& tag, bool write) const {
    if (arrayItemByTag() == 0 || tag.memoryType() == nullptr) return false;
    return tag.IsReadOnly() || engine::declaredBlock(tag, write) != 0;
}
