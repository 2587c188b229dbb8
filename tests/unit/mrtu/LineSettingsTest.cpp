// What the driver knows of baud rates, and the words of the settings.
#include "mrtu/LineSettings.h"

#include <gtest/gtest.h>

#include <utility>

namespace {

TEST(LineSettingsTest, InterCharacterGap) {
    const std::pair<int, int> gaps[] = {
        {150, 800},  {300, 400},      {600, 200},           {1200, 100}, {2400, 50},  {4800, 25},
        {9600, 13},  {19200, 7},      {38400, 4},           {57600, 3},  {115200, 2}, {119999, 2},
        {120000, 1}, {120001, 1},     {500000, 1},          {1, 120000}, {0, 1},      {-1, 1},
        {-9600, 1},  {2147483647, 1}, {-2147483647 - 1, 1},
    };
    for (const auto& [baud, gap] : gaps)
        EXPECT_EQ(gap, _MRTU::interCharacterGap(baud)) << baud;
}

TEST(LineSettingsTest, ListedBaudRates) {
    for (const int baud : {150, 300, 600, 1200, 2400, 4800, 9600, 19200, 38400, 57600, 115200})
        EXPECT_TRUE(_MRTU::isListedBaudRate(baud)) << baud;
    for (const int baud : {0, 1, 110, 149, 14400, 28800, 115201, 230400, -9600})
        EXPECT_FALSE(_MRTU::isListedBaudRate(baud)) << baud;
}

TEST(LineSettingsTest, EveryParityCode) {
    const char* const words[] = {"none", "even", "odd", "mark", "space"};
    for (int code = -2; code < 300; ++code)
        EXPECT_STREQ(code >= 0 && code <= 4 ? words[code] : "none", _MRTU::parityWord(code))
            << code;
}

TEST(LineSettingsTest, EveryModeCode) {
    const char* const words[] = {"RS-232", "RS-485", "RS-422", "RS-485P"};
    for (int code = -2; code < 300; ++code)
        EXPECT_STREQ(code >= 0 && code <= 3 ? words[code] : "RS-232", _MRTU::modeWord(code))
            << code;
}

TEST(LineSettingsTest, ConfiguredWordsHaveCodes) {
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

}  // namespace
