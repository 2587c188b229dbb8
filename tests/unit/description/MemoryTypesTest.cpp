// The memory types that a configuration tool offers.
#include <gtest/gtest.h>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

struct Area {
    std::string name;
    std::string display;
    bool bitWrite;
    bool bitRead;
    bool bitArrayWrite;
    bool readOnly;
    int readCount;
    int writeCount;
    std::string mask;
    std::string naturalType;
    int min;
    int max;
};

// clang-format off
const std::vector<Area> areas{
    {"INP", "Input Status", false, true, false, true, 2000, 0, "0x1001", "boolean", 100001, 165536},
    {"OUTP", "Coil Status", true, true, true, false, 2000, 1968, "0x1001", "boolean", 1, 65536},
    {"HREG", "Holding Registers", false, false, false, false, 125, 123, "0x3dff7ff", "unsignedShort", 400001, 465536},
    {"IREG", "Input Registers", false, false, false, true, 125, 0, "0x3dff7ff", "unsignedShort", 300001, 365536},
    {"LONG", "32 bit Registers", false, false, false, false, 62, 61, "0xc80c8", "unsignedInt", 0, 65535},
    {"NO", "Node Override ID", false, false, false, false, 1, 1, "0x10", "unsignedByte", 0, 1},
    {"NP_Mode", "Modicon Mode", false, false, false, false, 1, 1, "0x1", "boolean", 0, 0},
    {"SP_Baud", "Serial Baudrate", false, false, false, false, 0, 0, "0x40", "unsignedInt", 0, 0},
    {"SP_Par", "Serial Parity", false, false, false, false, 0, 0, "0x10", "unsignedByte", 0, 0},
    {"SP_Stop", "Serial Stop Bits", false, false, false, false, 0, 0, "0x10", "unsignedByte", 0, 0},
    {"SP_Mode", "Serial Mode", false, false, false, false, 0, 0, "0x10", "boolean", 0, 0},
    {"SP_Done", "Serial Done", false, false, false, false, 0, 0, "0x1", "boolean", 0, 0},
};
// clang-format on

std::string word(bool value) {
    return value ? "true" : "false";
}

Attributes expectedAttributes(const Area& area) {
    return {
        {"canBitWrite", word(area.bitWrite)},
        {"isSwap2", "false"},
        {"display", area.display},
        {"isSwap4", "false"},
        {"mustBitRead", word(area.bitRead)},
        {"blockReadCount", std::to_string(area.readCount)},
        {"blockWriteCount", std::to_string(area.writeCount)},
        {"icomTypes", area.mask},
        {"naturalType", area.naturalType},
        {"isSwap8", "false"},
        {"hasInternalConversion", "false"},
        {"useInDatagram", "false"},
        {"canBitArrayWrite", word(area.bitArrayWrite)},
        {"min", std::to_string(area.min)},
        {"max", std::to_string(area.max)},
        {"isReadOnly", word(area.readOnly)},
        {"isWriteOnly", "false"},
    };
}

TEST(MemoryTypesTest, NamesStandInOrder) {
    std::vector<std::string> names;
    names.reserve(areas.size());
    for (const Area& area : areas)
        names.push_back(area.name);
    EXPECT_EQ(names, childTexts(root().child("memtypes")));
}

TEST(MemoryTypesTest, AttributesAreThoseOfTheAreaAndInOrder) {
    for (const Area& area : areas) {
        const auto element = childWithText(root().child("memtypes"), area.name);
        EXPECT_STREQ("memtype", element.name()) << area.name;
        EXPECT_EQ(expectedAttributes(area), attributesOf(element)) << area.name;
    }
}

}  // namespace
}  // namespace description_test
