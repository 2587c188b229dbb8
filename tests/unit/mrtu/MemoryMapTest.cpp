// The memory map against a copy that was typed on its own.
#include "mrtu/MemoryMap.h"

#include "tests/unit/mrtu/DriverTest.h"

namespace {

struct Row {
    const char* name;
    int naturalType;
    int icomTypes;
    bool bitRead;
    bool bitWrite;
    bool bitArrayWrite;
    bool readOnly;
    int blockRead;
    int blockWrite;
};

const Row kRows[] = {
    {"INP", 1, 0x1001, true, false, false, true, 2000, 0},
    {"OUTP", 1, 0x1001, true, true, true, false, 2000, 1968},
    {"HREG", 6, 0x3dff7ff, false, false, false, false, 125, 123},
    {"IREG", 6, 0x3dff7ff, false, false, false, true, 125, 0},
    {"LONG", 7, 0xc80c8, false, false, false, false, 62, 61},
    {"NO", 5, 0x10, false, false, false, false, 1, 1},
    {"NP_Mode", 1, 0x1, false, false, false, false, 1, 1},
    {"SP_Baud", 7, 0x40, false, false, false, false, 0, 0},
    {"SP_Par", 5, 0x10, false, false, false, false, 0, 0},
    {"SP_Stop", 5, 0x10, false, false, false, false, 0, 0},
    {"SP_Mode", 1, 0x10, false, false, false, false, 0, 0},
    {"SP_Done", 1, 0x1, false, false, false, false, 0, 0},
};

struct Range {
    const char* name;
    int oneBasedMin;
    int oneBasedMax;
    int zeroBasedMin;
    int zeroBasedMax;
};

const Range kRanges[] = {
    {"INP", 100001, 165536, 100000, 165535},
    {"OUTP", 1, 65536, 0, 65535},
    {"HREG", 400001, 465536, 400000, 465535},
    {"IREG", 300001, 365536, 300000, 365535},
    {"LONG", 0, 65535, 0, 65535},
    {"NO", 0, 1, 0, 1},
    {"NP_Mode", 0, 0, 0, 0},
    {"SP_Baud", 0, 0, 0, 0},
    {"SP_Par", 0, 0, 0, 0},
    {"SP_Stop", 0, 0, 0, 0},
    {"SP_Mode", 0, 0, 0, 0},
    {"SP_Done", 0, 0, 0, 0},
};

class MemoryMapTest : public driver_test::DriverTest {
  protected:
    const MemoryManager& map() const { return *driver->getMemoryManager(); }
};

bool isEnron(const std::string& model) {
    return model == "3" || model == "4";
}

TEST_F(MemoryMapTest, FourModelsInOrderWithoutDatagrams) {
    std::vector<std::string> names;
    for (const Model& model : map().getModels()) {
        names.push_back(model.getName());
        EXPECT_EQ(0, model.getMaxDatagramItems());
        EXPECT_EQ(0, model.getMaxDatagramLength());
    }
    EXPECT_EQ((std::vector<std::string>{"1", "2", "3", "4"}), names);
}

TEST_F(MemoryMapTest, EveryModelHoldsItsTypesInOrder) {
    for (const Model& model : map().getModels()) {
        std::vector<std::string> expected;
        for (const Row& row : kRows)
            if (isEnron(model.getName()) || std::string(row.name) != "LONG")
                expected.emplace_back(row.name);
        std::vector<std::string> names;
        for (const MemoryType& type : model.getMemoryTypes())
            names.push_back(type.getName());
        EXPECT_EQ(expected, names) << "model " << model.getName();
    }
}

TEST_F(MemoryMapTest, SettingsOfEveryType) {
    for (const char* model : {"1", "2", "3", "4"}) {
        for (const Row& row : kRows) {
            SCOPED_TRACE(std::string(row.name) + " in model " + model);
            const MemoryType* type = map().getMemoryType(model, row.name);
            if (std::string(row.name) == "LONG" && !isEnron(model)) {
                EXPECT_EQ(nullptr, type);
                continue;
            }
            ASSERT_NE(nullptr, type);
            EXPECT_EQ(row.naturalType, static_cast<int>(type->getNaturalType()));
            EXPECT_EQ(row.icomTypes, type->getIcomTypes());
            EXPECT_EQ(row.bitRead, type->isBitRead());
            EXPECT_EQ(row.bitWrite, type->isBitWrite());
            EXPECT_EQ(row.bitArrayWrite, type->isBitArrayWrite());
            EXPECT_EQ(row.readOnly, type->isReadOnly());
            EXPECT_EQ(row.blockRead, type->getBlockReadCount());
            EXPECT_EQ(row.blockWrite, type->getBlockWriteCount());
            EXPECT_FALSE(type->isSwap2() || type->isSwap4() || type->isSwap8());
            EXPECT_FALSE(type->isWriteOnly() || type->isInDatagram());
            EXPECT_FALSE(type->hasInternalConversion());
        }
    }
}

TEST_F(MemoryMapTest, IndexRangesOfEveryModel) {
    for (const char* model : {"1", "2", "3", "4"}) {
        const bool oneBased = std::string(model) == "1" || std::string(model) == "3";
        for (const Range& range : kRanges) {
            const MemoryType* type = map().getMemoryType(model, range.name);
            if (type == nullptr) continue;
            EXPECT_EQ(oneBased ? range.oneBasedMin : range.zeroBasedMin, type->getMinIndex())
                << range.name << " in model " << model;
            EXPECT_EQ(oneBased ? range.oneBasedMax : range.zeroBasedMax, type->getMaxIndex())
                << range.name << " in model " << model;
        }
    }
}

TEST_F(MemoryMapTest, InputRegistersExistInModelTwoAndLongOnesNotInModelOne) {
    EXPECT_NE(nullptr, map().getMemoryType("2", "IREG"));
    EXPECT_EQ(nullptr, map().getMemoryType("1", "LONG"));
    EXPECT_EQ(nullptr, map().getMemoryType("5", "HREG"));
    EXPECT_EQ(nullptr, map().getMemoryType("1", "hreg"));
    EXPECT_EQ("1", map().getModel("unknown")->getName());
}

TEST_F(MemoryMapTest, AddressTableHasFiveRows) {
    struct Copy {
        const char* name;
        int shortMin, shortMax, longMin, longMax;
    };
    const Copy copies[] = {
        {"INP", 10001, 19999, 100001, 165536},  {"OUTP", 1, 9999, 1, 65536},
        {"HREG", 40001, 49999, 400001, 465536}, {"IREG", 30001, 39999, 300001, 365536},
        {"LONG", 0, 65535, 0, 65535},
    };
    ASSERT_EQ(std::size(copies), _MRTU::table.size());
    for (std::size_t i = 0; i < std::size(copies); ++i) {
        const _MRTU::AddressRange& row = _MRTU::table[i];
        EXPECT_EQ(row.name, copies[i].name);
        EXPECT_EQ(row.shortMin, copies[i].shortMin) << row.name;
        EXPECT_EQ(row.shortMax, copies[i].shortMax) << row.name;
        EXPECT_EQ(row.longMin, copies[i].longMin) << row.name;
        EXPECT_EQ(row.longMax, copies[i].longMax) << row.name;
        EXPECT_EQ(&row, _MRTU::addressRange(copies[i].name));
    }
    EXPECT_EQ(nullptr, _MRTU::addressRange("NO"));
    EXPECT_EQ(nullptr, _MRTU::addressRange("hreg"));
}

}  // namespace
