// The report of the line's settings.
#include <cstring>

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

}  // namespace
