// From the configuration to the settings of the line.
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::configText;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::rtuFrame;
using driver_test::ScriptedPort;

class ConfigTest : public DriverTest {
  protected:
    /// The settings that the port gets from a new driver: one that has started before keeps the
    /// settings of its first start.
    ScriptedPort::Settings opened(const std::string& items) {
        restartDriver();
        port.forget();
        start(items);
        driver->Stop();
        return port.settings().empty() ? ScriptedPort::Settings{} : port.settings().back();
    }

    /// The settings that the driver holds.
    std::string report() const {
        char text[80] = {};
        driver->vcsGetComParams(text, sizeof(text) - 1);
        return text;
    }

    /// The message of a refused configuration.
    std::string refusal(const std::string& text) {
        plantError();
        EXPECT_EQ(0, driver->Config(text.c_str())) << text;
        EXPECT_EQ(-1, driver->GetLastError()) << text;
        return driver->GetLastErrorString();
    }
};

TEST_F(ConfigTest, SettingsReachThePort) {
    EXPECT_EQ((ScriptedPort::Settings{9600, 0, 8, 1, 0}), opened(""));
    EXPECT_EQ((ScriptedPort::Settings{115200, 1, 7, 2, 2}),
              opened("txMode=ASCII baudrate=115200 parity=even bits=7 stopbits=2 mode=RS-422"));
}

TEST_F(ConfigTest, ParityWordsWithoutRegardToCase) {
    const std::pair<const char*, int> words[] = {
        {"none", 0}, {"NONE", 0}, {"even", 1}, {"EVEN", 1}, {"Even", 1},
        {"odd", 2},  {"oDD", 2},  {"mark", 3}, {"Mark", 3},
    };
    for (const auto& [word, code] : words)
        EXPECT_EQ(code, opened(std::string("parity=") + word).parity) << word;
}

TEST_F(ConfigTest, OtherParityWordsAreRefused) {
    for (const char* word : {"space", "n", "0", "evenn", "non"})
        EXPECT_EQ("Parser: parameter 'parity' has invalid value",
                  refusal(configText(std::string("parity=") + word)))
            << word;
    EXPECT_EQ("Parser: parameter 'parity' has invalid value", refusal(configText("parity=")));
}

TEST_F(ConfigTest, ModeWordsInExactCase) {
    EXPECT_EQ(0, opened("mode=RS-232").mode);
    EXPECT_EQ(1, opened("mode=RS-485").mode);
    EXPECT_EQ(2, opened("mode=RS-422").mode);
    for (const char* word : {"rs-485", "RS485", "RS-485P", "0"})
        EXPECT_EQ("Parser: parameter 'mode' has invalid value",
                  refusal(configText(std::string("mode=") + word)))
            << word;
}

TEST_F(ConfigTest, ParityIsReportedBeforeMode) {
    EXPECT_EQ("Parser: parameter 'parity' has invalid value",
              refusal(configText("parity=x mode=y")));
}

TEST_F(ConfigTest, ManagersMessagesAreTheProtocolsErrors) {
    EXPECT_EQ("Parser: unknown format", refusal("timeout=5"));
    EXPECT_EQ("parameter 'maxOptLen' out of range", refusal(configText("maxOptLen=-1")));
    EXPECT_EQ("Parser: parameter 'defNodeId' is not found", refusal("CfgVer=1 "));
    EXPECT_EQ("Parser: parameter 'uart' is not found", refusal("CfgVer=1 defNodeId=1"));
}

TEST_F(ConfigTest, DataBitsFollowTheTransmissionMode) {
    EXPECT_EQ(8, opened("txMode=RTU bits=7").dataBits);
    EXPECT_EQ(7, opened("txMode=ASCII bits=7").dataBits);
    EXPECT_EQ(7, opened("txMode=rtu bits=7").dataBits);
    EXPECT_EQ(8, opened("bits=7").dataBits) << "RTU is the default";
}

TEST_F(ConfigTest, RtuNeedsNoDataBits) {
    EXPECT_NE(0, driver->Config("CfgVer=1 txMode=RTU defNodeId=1 uart=com1 baudrate=9600 "
                                "parity=none stopbits=1 mode=RS-232"));
    EXPECT_EQ("Parser: parameter 'bits' is not found",
              refusal("CfgVer=1 txMode=ASCII defNodeId=1 uart=com1 baudrate=9600 parity=none "
                      "stopbits=1 mode=RS-232"));
}

TEST_F(ConfigTest, RecordsStayFilledWhenParityIsRefused) {
    refusal(configText("timeout=77 parity=x"));
    EXPECT_EQ(77, driver->getParamManager()->getNodeParams(1)->timeout);
}

TEST_F(ConfigTest, RefusedParityComesBehindPortRateAndBits) {
    configure("txMode=RTU uart=com1 baudrate=9600 parity=even stopbits=1 mode=RS-485");
    refusal(
        configText("txMode=ASCII uart=com2 baudrate=19200 parity=bad bits=7 stopbits=2 "
                   "mode=RS-232"));
    EXPECT_EQ("com2,19200,even,7,2,RS-485", report());
}

TEST_F(ConfigTest, RefusedModeComesBehindTheParity) {
    configure("parity=even mode=RS-485");
    refusal(configText("uart=com2 baudrate=19200 parity=odd stopbits=2 mode=bad"));
    EXPECT_EQ("com2,19200,odd,8,2,RS-485", report());
}

TEST_F(ConfigTest, RefusedFirstTextIsTakenOverAsFarAsItGoes) {
    refusal(configText("uart=com3 baudrate=300 parity=bad stopbits=2 mode=RS-485"));
    EXPECT_EQ("com3,300,none,8,2,RS-232", report());
}

TEST_F(ConfigTest, GapStaysWhenParityOrModeIsRefused) {
    start("baudrate=9600");
    for (const char* bad : {"parity=bad", "mode=bad"}) {
        refusal(configText(std::string("baudrate=150 ") + bad));
        port.forget();
        port.reply(rtuFrame(hex("01 03 02 12 34")));
        EXPECT_TRUE(read(tag("1?HREG?400001?short"), 1));
        EXPECT_EQ(13, port.frameWaits().at(0).gapMs) << bad;
    }
}

TEST_F(ConfigTest, EverythingStaysAsItWasWhenTheTextIsRefused) {
    configure("timeout=77 uart=com2 parity=odd");
    const std::string before = report();
    refusal("CfgVer=1 timeout=5");
    refusal("CfgVer=1 timeout=5 defNodeId=1 uart=com7 baudrate=300 parity=none");
    EXPECT_EQ(77, driver->getParamManager()->getNodeParams(1)->timeout);
    EXPECT_EQ(before, report());
}

}  // namespace
