// From the addresses that people write to those that go over the line.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;

struct AddressCase {
    const char* area;
    int address;
    int offset;  ///< -1: refused.
};

class NormalisationTest : public DriverTest {
  protected:
    void check(const char* model, const std::vector<AddressCase>& cases) {
        configure(std::string("model=") + model);
        for (const AddressCase& one : cases) {
            const std::string area(one.area);
            const bool bits = area == "INP" || area == "OUTP";
            const std::string uri =
                "1?" + area + "?" + std::to_string(one.address) + "?" + (bits ? "boolean" : "int");
            SCOPED_TRACE("model " + std::string(model) + " " + uri);
            if (one.offset < 0) {
                expectRefused(uri, "invalid offset for this memory type");
            } else {
                EXPECT_EQ(one.offset, tag(uri)->offset());
            }
        }
    }
};

const std::vector<AddressCase> kOneBased{
    {"HREG", 400001, 0},   {"HREG", 400010, 9},     {"HREG", 465536, 65535}, {"HREG", 40001, 0},
    {"HREG", 49999, 9998}, {"HREG", 400000, -1},    {"HREG", 465537, -1},    {"HREG", 40000, -1},
    {"HREG", 50000, -1},   {"HREG", 0, -1},         {"HREG", 1, -1},         {"HREG", -1, -1},
    {"IREG", 300001, 0},   {"IREG", 365536, 65535}, {"IREG", 30001, 0},      {"IREG", 39999, 9998},
    {"IREG", 300000, -1},  {"IREG", 365537, -1},    {"IREG", 30000, -1},     {"IREG", 40001, -1},
    {"INP", 100001, 0},    {"INP", 165536, 65535},  {"INP", 10001, 0},       {"INP", 19999, 9998},
    {"INP", 100000, -1},   {"INP", 165537, -1},     {"INP", 10000, -1},      {"INP", 20000, -1},
    {"OUTP", 1, 0},        {"OUTP", 9999, 9998},    {"OUTP", 10000, 9999},   {"OUTP", 65536, 65535},
    {"OUTP", 0, -1},       {"OUTP", 65537, -1},
};

const std::vector<AddressCase> kZeroBased{
    {"HREG", 400000, 0},   {"HREG", 400001, 1},     {"HREG", 465535, 65535}, {"HREG", 40000, 0},
    {"HREG", 49998, 9998}, {"HREG", 465536, -1},    {"HREG", 399999, -1},    {"HREG", 49999, -1},
    {"IREG", 300000, 0},   {"IREG", 365535, 65535}, {"IREG", 30000, 0},      {"IREG", 365536, -1},
    {"INP", 100000, 0},    {"INP", 165535, 65535},  {"INP", 10000, 0},       {"INP", 165536, -1},
    {"OUTP", 0, 0},        {"OUTP", 65535, 65535},  {"OUTP", 65536, -1},     {"OUTP", -1, -1},
};

const std::vector<AddressCase> kLong{
    {"LONG", 0, 0}, {"LONG", 5, 5}, {"LONG", 65535, 65535}, {"LONG", 65536, -1}, {"LONG", -1, -1},
};

TEST_F(NormalisationTest, ModiconModel) {
    check("1", kOneBased);
}
TEST_F(NormalisationTest, GenericModel) {
    check("2", kZeroBased);
}

TEST_F(NormalisationTest, EnronModelFromOne) {
    check("3", kOneBased);
    check("3", kLong);
}

TEST_F(NormalisationTest, EnronModelFromZero) {
    check("4", kZeroBased);
    check("4", kLong);
}

TEST_F(NormalisationTest, BitAreasSplitTheirOffsetIntoByteAndBit) {
    configure();
    const Tag_MRTU* coil = tag("1?OUTP?22?boolean");
    EXPECT_EQ(21, coil->offset());
    EXPECT_EQ(2U, coil->GetByteOffset());
    EXPECT_EQ(5, coil->GetBitIndex());
}

TEST_F(NormalisationTest, AddressHasAutomaticBase) {
    configure("model=2");
    EXPECT_EQ(16, tag("1?OUTP?0x10?boolean")->offset());
    EXPECT_EQ(8, tag("1?OUTP?010?boolean")->offset());
    EXPECT_EQ(8, tag("1?OUTP?8?boolean")->offset());
}

/// A refused address of a 0-based model keeps the 1 that was added to it.
TEST_F(NormalisationTest, RefusedZeroBasedAddressKeepsItsIncrement) {
    configure("model=2");
    Tag_MRTU coil("1?OUTP?0?boolean", driver->tagUriNames());
    ASSERT_TRUE(coil.parseTagUrl(driver.get()));
    coil.setOffset(65536);
    EXPECT_FALSE(coil.normalizeModbusOffset());
    EXPECT_EQ(65537, coil.offset());
}

TEST_F(NormalisationTest, RefusedOneBasedAddressStaysAsItIs) {
    configure();
    Tag_MRTU coil("1?OUTP?1?boolean", driver->tagUriNames());
    ASSERT_TRUE(coil.parseTagUrl(driver.get()));
    coil.setOffset(65537);
    EXPECT_FALSE(coil.normalizeModbusOffset());
    EXPECT_EQ(65537, coil.offset());
}

TEST_F(NormalisationTest, DriverAreasKeepTheirOffset) {
    configure("model=2");
    Tag_MRTU area("1?NO?0?unsignedByte", driver->tagUriNames());
    ASSERT_TRUE(area.parseTagUrl(driver.get()));
    EXPECT_EQ(0, area.offset());
    area.setOffset(1);
    EXPECT_FALSE(area.normalizeModbusOffset());
    EXPECT_EQ(1, area.offset());
}

}  // namespace
