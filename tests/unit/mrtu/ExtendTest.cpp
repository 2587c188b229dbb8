// The extensions.
#include <cstring>

#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;

class ExtendTest : public DriverTest {
  protected:
    static ExtensionRecord record(int queryCode) {
        ExtensionRecord made;
        std::memset(&made, 0x77, sizeof made);
        made.queryCode = queryCode;
        return made;
    }
};

TEST_F(ExtendTest, RecordHasItsByteAtOffsetSixtySix) {
    ExtensionRecord made = record(0);
    EXPECT_EQ(66, &made.value - reinterpret_cast<std::uint8_t*>(&made));
    EXPECT_EQ(4, made.flags - reinterpret_cast<std::uint8_t*>(&made));
}

TEST_F(ExtendTest, OnlyExtensionThreeIsAnnounced) {
    for (const int code : {-1, 0, 1, 2, 3, 4, 256 + 3, 0x03000000}) {
        ExtensionRecord made = record(code);
        EXPECT_EQ(1, driver->Extend(0, &made)) << code;
        EXPECT_EQ(code == 3 ? 1 : 0, made.flags[0]) << code;
        EXPECT_EQ(0, made.flags[1] | made.flags[2] | made.flags[3]) << code;
        ExtensionRecord rest = record(code);
        std::memcpy(rest.flags, made.flags, sizeof rest.flags);
        EXPECT_EQ(0, std::memcmp(&rest, &made, sizeof made)) << "only the flags change";
    }
}

TEST_F(ExtendTest, ExtensionThreeReturnsItsByteUnsigned) {
    ExtensionRecord made = record(0);
    for (const int value : {0, 1, 127, 128, 255}) {
        made.value = static_cast<std::uint8_t>(value);
        EXPECT_EQ(value, driver->Extend(3, &made));
    }
}

TEST_F(ExtendTest, OtherCodesReturnZeroAndTouchNothing) {
    for (const int code : {1, 2, 4, -1, 100}) {
        ExtensionRecord made = record(3);
        const ExtensionRecord before = made;
        EXPECT_EQ(0, driver->Extend(code, &made)) << code;
        EXPECT_EQ(0, std::memcmp(&before, &made, sizeof made)) << code;
    }
}

}  // namespace
