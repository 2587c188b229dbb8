#include "tests/unit/engine/EngineFakeDriver.h"

#include <gtest/gtest.h>

#include <array>
#include <memory>
#include <utility>

#include "framework/DataTypes.h"
#include "framework/TextUtils.h"

namespace {

struct MemoryRow {
    const char* name;
    ICU_Type natural;
    int readCount;
    int writeCount;
    bool readOnly;
    int minIndex;
    int maxIndex;
};

constexpr std::array kMemories{
    MemoryRow{"REG", ICU_Type::unsignedShort, 125, 123, false, 0, 65535},
    MemoryRow{"IREG", ICU_Type::unsignedShort, 125, 0, true, 0, 65535},
    MemoryRow{"LONG", ICU_Type::unsignedInt, 62, 61, false, 0, 65535},
    MemoryRow{"BYTE", ICU_Type::unsignedByte, 200, 200, false, 0, 65535},
    MemoryRow{"COIL", ICU_Type::boolean, 2000, 1968, false, 0, 65535},
    MemoryRow{"SMALL", ICU_Type::boolean, 8, 8, false, 5, 14},
    MemoryRow{"AREA", ICU_Type::unsignedInt, 0, 0, false, 0, 0},
    MemoryRow{"FLAG", ICU_Type::boolean, 0, 0, false, 0, 0},
};

MemoryType memoryType(const MemoryRow& row) {
    MemoryType type;
    type.setName(row.name);
    type.setNaturalType(row.natural);
    type.setIcomTypes(0x3fffff);
    type.setBlockReadCount(row.readCount);
    type.setBlockWriteCount(row.writeCount);
    type.setReadOnly(row.readOnly);
    type.setMinIndex(row.minIndex);
    type.setMaxIndex(row.maxIndex);
    return type;
}

constexpr const char* kFields[] = {"nodeid", "memorytype", "arrayindex.subindex", "datatype",
                                   nullptr};

}  // namespace

FakeDriver::FakeDriver() {
    for (const char* name : {"A", "B"}) {
        Model model(name);
        model.setMaxDatagramItems(3);
        model.setMaxDatagramLength(10);
        for (const MemoryRow& row : kMemories) {
            MemoryType type = memoryType(row);
            type.setInDatagram(type.getName() == "REG" || type.getName() == "LONG");
            model.addMemoryType(type);
            memories_.try_emplace(row.name, type);
        }
        manager_.addModel(model);
    }
}

const ITag* FakeDriver::tag(const std::string& uri) {
    const ITag* tag = CreateTag(uri.c_str());
    EXPECT_NE(tag, nullptr) << uri << ": " << GetLastErrorString();
    return tag;
}

// Node 9 has model "B", every other one model "A".
ITag* FakeDriver::CreateTagBase(const char* uri) {
    auto tag = std::make_unique<ProtgenTag>(uri, kFields);
    std::vector<std::string> fields;
    ProtUtilsN::ParseSubstrings(uri, fields, '?');
    ICU_Type type{};
    ICU_Type itemType{};
    int length = 0;
    std::vector<std::string> conversions;
    if (fields.size() != 4 ||
        !ProtUtilsN::GetICOMType(fields[3], type, itemType, length, conversions)) {
        SetTagError(tag.get());
        return nullptr;
    }
    tag->setNodeId(ProtUtilsN::parseInteger(fields[0].c_str()));
    const char* model = tag->nodeId() == 9 ? "B" : "A";
    tag->setModel(manager_.getModel(model));
    tag->setMemoryType(manager_.getMemoryType(model, fields[1]));
    if (!tag->setDataType(type, itemType, length, conversions)) return nullptr;
    return tag.release();
}

const char* const* FakeDriver::tagUriNames() const {
    return kFields;
}

std::string FakeDriver::calls() {
    return std::exchange(calls_, std::string());
}

void FakeDriver::failCall(int call) {
    callsUntilFailure_ = call;
}

int FakeDriver::getMaxItemCount(const ProtgenTag* tag, bool write) const {
    if (limit_ >= 0) return limit_;
    const MemoryType& type = *tag->memoryType();
    return write ? type.getBlockWriteCount() : type.getBlockReadCount();
}

int FakeDriver::doWrite(const ProtgenTag* tag, int index, const unsigned char* data, int count) {
    EXPECT_FALSE(reach(tag).isBits());
    if (!enter(tag, "write ", index, count, true)) return 0;
    const std::lock_guard<std::mutex> lock(lineMutex_);
    reach(tag).write(index, data, count);
    return 1;
}

bool FakeDriver::doReadBlock(const ProtgenTag* tag, int index, unsigned char* data, int count) {
    EXPECT_FALSE(reach(tag).isBits());
    if (!enter(tag, "read ", index, count, false)) return false;
    const std::lock_guard<std::mutex> lock(lineMutex_);
    reach(tag).read(index, data, count);
    return true;
}

int FakeDriver::doWriteBits(const ProtgenTag* tag, int index, const unsigned char* data,
                            int count) {
    EXPECT_TRUE(reach(tag).isBits());
    if (!enter(tag, "writeBits ", index, count, true)) return 0;
    const std::lock_guard<std::mutex> lock(lineMutex_);
    reach(tag).write(index, data, count);
    return 1;
}

bool FakeDriver::doReadBits(const ProtgenTag* tag, int index, unsigned char* data, int count) {
    EXPECT_TRUE(reach(tag).isBits());
    if (!enter(tag, "readBits ", index, count, false)) return false;
    const std::lock_guard<std::mutex> lock(lineMutex_);
    reach(tag).read(index, data, count);
    return true;
}

FakeMemory& FakeDriver::reach(const ProtgenTag* tag) {
    return memories_.at(tag->memoryType()->nameRef());
}

bool FakeDriver::enter(const ProtgenTag* tag, const char* what, int index, int count, bool write) {
    expectPossible(tag, index, count, write);
    if (onCall_) onCall_();
    if (logging_) {
        if (!calls_.empty()) calls_ += ", ";
        calls_ += what + std::to_string(index) + "+" + std::to_string(count);
    }
    if (callsUntilFailure_ == 0 || --callsUntilFailure_ > 0) return true;
    SetError(-4, "No response");
    return false;
}

void FakeDriver::expectPossible(const ProtgenTag* tag, int index, int count, bool write) const {
    const MemoryType& type = *tag->memoryType();
    EXPECT_GE(index, 0) << tag->GetVarName();
    EXPECT_GE(count, 1) << tag->GetVarName();
    EXPECT_FALSE(write && type.isReadOnly()) << tag->GetVarName();
    const int block = write ? type.getBlockWriteCount() : type.getBlockReadCount();
    if (block == 0) return;
    EXPECT_LE(count, block) << tag->GetVarName();
    EXPECT_LE(index + count, type.getMaxIndex() - type.getMinIndex() + 1) << tag->GetVarName();
}
