#include "Memo.h"

#include <cstring>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include "framework/CfgParser.h"
#include "framework/DataTypes.h"
#include "framework/TextUtils.h"

namespace memo {
namespace {

constexpr const char* kArea = "CELL";
// The engine finds the cell's number by this name.
constexpr const char* kUriNames[] = {"memorytype", "arrayindex.subindex", "datatype", nullptr};

Model onlyModel() {
    MemoryType cells;
    cells.setName(kArea);
    cells.setNaturalType(ICU_Type::unsignedShort);
    cells.setMaxIndex(Memo::kCells - 1);
    // What one request may carry. A real device sets this limit.
    cells.setBlockReadCount(100);
    cells.setBlockWriteCount(100);
    Model model("1");
    model.addMemoryType(cells);
    return model;
}

}  // namespace

Memo::Memo() {
    memory_.addModel(onlyModel());
}

Memo::~Memo() {
    DeleteTags();
}

int Memo::Config(const char* text) {
    if (CfgParser(text).KnownFormat()) return 1;
    SetError(-1, "The configuration does not begin with CfgVer=1");
    return 0;
}

ITag* Memo::refuse(const char* text) {
    SetError(-1, text);
    return nullptr;
}

// Nothing may be thrown across the boundary to the host.
ITag* Memo::CreateTagBase(const char* uri) try {
    std::vector<std::string> fields;
    ProtUtilsN::ParseSubstrings(uri, fields, '?');
    if (fields.size() != 3) return refuse("A tag is memorytype?index?datatype");

    // The tag is the engine's, which tells of short memory instead of throwing.
    auto tag = std::make_unique<ProtgenTag>(uri, kUriNames);
    if (!tag->isComplete()) return refuse("Out of memory");
    tag->setModel(memory_.getModel("1"));
    tag->setMemoryType(memory_.getMemoryType("1", fields[0]));
    if (tag->memoryType() == nullptr) return refuse("The only memory type is CELL");
    if (tag->offset() < 0 || tag->offset() >= kCells) return refuse("Cells are 0 to 999");

    ICU_Type type{};
    ICU_Type itemType{};
    int length = 0;
    std::vector<std::string> conversions;
    if (!ProtUtilsN::GetICOMType(fields[2], type, itemType, length, conversions))
        return refuse("Data type unknown");
    if (!tag->setDataType(type, itemType, length, std::move(conversions)))
        return refuse("Out of memory");
    return tag.release();
} catch (const std::bad_alloc&) {
    return refuse("Out of memory");
}

int Memo::GetMaxTm(const ITag* /*tag*/) const {
    return 1;
}

const char* const* Memo::tagUriNames() const {
    return kUriNames;
}

int Memo::getMaxItemCount(const ProtgenTag* tag, bool write) const {
    return write ? tag->memoryType()->getBlockWriteCount() : tag->memoryType()->getBlockReadCount();
}

// The engine has checked index and count against the area: here a real driver talks to its device.
bool Memo::doReadBlock(const ProtgenTag* /*tag*/, int index, unsigned char* data, int count) {
    const std::lock_guard lock(mutex_);
    std::memcpy(data, &cells_[static_cast<std::size_t>(index)],
                static_cast<std::size_t>(count) * sizeof cells_[0]);
    return true;
}

int Memo::doWrite(const ProtgenTag* /*tag*/, int index, const unsigned char* data, int count) {
    const std::lock_guard lock(mutex_);
    std::memcpy(&cells_[static_cast<std::size_t>(index)], data,
                static_cast<std::size_t>(count) * sizeof cells_[0]);
    return 1;
}

// Only areas whose items are bits come here; this driver has none.
bool Memo::doReadBits(const ProtgenTag* /*tag*/, int /*index*/, unsigned char* /*data*/,
                      int /*count*/) {
    SetError(-3, "There is no area of bits");
    return false;
}

int Memo::doWriteBits(const ProtgenTag* /*tag*/, int /*index*/, const unsigned char* /*data*/,
                      int /*count*/) {
    SetError(-3, "There is no area of bits");
    return 0;
}

}  // namespace memo
