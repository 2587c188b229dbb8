// The report of the line's settings and the extensions.
#include <cstring>

#include "mrtu/LineSettings.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::DriverTest;

class ReportTest : public DriverTest {
  protected:
    std::string report() {
        char text[100];
        std::memset(text, 'x', sizeof text);
        EXPECT_EQ(1, driver->vcsGetComParams(text, sizeof text));
        return text;
    }
};

TEST_F(ReportTest, ConfiguredSettings) {
    configure();
    EXPECT_EQ("com1,9600,none,8,1,RS-232", report());
    configure("txMode=ASCII uart=com16 baudrate=115200 parity=EVEN bits=7 stopbits=2 mode=RS-485");
    EXPECT_EQ("com16,115200,even,7,2,RS-485", report());
    configure("parity=odd mode=RS-422");
    EXPECT_EQ("com1,9600,odd,8,1,RS-422", report());
    configure("parity=mark");
    EXPECT_EQ("com1,9600,mark,8,1,RS-232", report());
}

TEST_F(ReportTest, PortNameIsReportedVerbatim) {
    configure("uart=/dev/tty,S0");
    EXPECT_EQ("/dev/tty,S0,9600,none,8,1,RS-232", report());
}

TEST_F(ReportTest, PersistedCodesBeyondTheConfigurationAreNamed) {
    host.stored.put("MRTU", "parity", 4);
    host.stored.put("MRTU", "mode", 3);
    start();
    EXPECT_EQ("com1,9600,space,8,1,RS-485P", report());
}

TEST_F(ReportTest, PersistedCodesThatNobodyKnows) {
    host.stored.put("MRTU", "parity", 7);
    host.stored.put("MRTU", "mode", 9);
    start();
    EXPECT_EQ("com1,9600,none,8,1,RS-232", report());
}

TEST_F(ReportTest, CopyIsBoundedAndPadded) {
    configure();
    const std::string whole = "com1,9600,none,8,1,RS-232";
    for (int size = 0; size <= 40; ++size) {
        std::string space(60, '#');
        EXPECT_EQ(1, driver->vcsGetComParams(space.data() + 10, size)) << size;
        std::string expected = whole.substr(0, static_cast<std::size_t>(size));
        expected.resize(static_cast<std::size_t>(size), '\0');
        EXPECT_EQ(std::string(10, '#') + expected + std::string(50 - expected.size(), '#'), space)
            << size;
    }
}

TEST_F(ReportTest, TenBytesReceiveTenCharacters) {
    configure();
    char text[11] = {};
    text[10] = '#';
    EXPECT_EQ(1, driver->vcsGetComParams(text, 10));
    EXPECT_EQ("com1,9600,#", std::string(text, 11));
}

TEST_F(ReportTest, Capability) {
    EXPECT_EQ(2, driver->vcsGetCapability());
    EXPECT_EQ(0, driver->vcsActivateInterleaved(1));
}

TEST(SettingsWordTest, EveryParityCode) {
    const char* const words[] = {"none", "even", "odd", "mark", "space"};
    for (int code = -2; code < 300; ++code)
        EXPECT_STREQ(code >= 0 && code <= 4 ? words[code] : "none", _MRTU::parityWord(code))
            << code;
}

TEST(SettingsWordTest, EveryModeCode) {
    const char* const words[] = {"RS-232", "RS-485", "RS-422", "RS-485P"};
    for (int code = -2; code < 300; ++code)
        EXPECT_STREQ(code >= 0 && code <= 3 ? words[code] : "RS-232", _MRTU::modeWord(code))
            << code;
}

TEST(SettingsWordTest, ConfiguredWordsHaveCodes) {
    EXPECT_EQ(0, _MRTU::parityCode("none"));
    EXPECT_EQ(1, _MRTU::parityCode("eVen"));
    EXPECT_EQ(2, _MRTU::parityCode("odd"));
    EXPECT_EQ(3, _MRTU::parityCode("MARK"));
    EXPECT_EQ(-1, _MRTU::parityCode("space"));
    EXPECT_EQ(-1, _MRTU::parityCode(""));
    EXPECT_EQ(0, _MRTU::modeCode("RS-232"));
    EXPECT_EQ(1, _MRTU::modeCode("RS-485"));
    EXPECT_EQ(2, _MRTU::modeCode("RS-422"));
    EXPECT_EQ(-1, _MRTU::modeCode("RS-485P"));
    EXPECT_EQ(-1, _MRTU::modeCode("rs-232"));
}

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
