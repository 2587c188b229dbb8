#include "runtime/SerialSettings.h"

#include <gtest/gtest.h>

#include <cstring>

namespace {

using namespace runtime;

constexpr tcflag_t kParityFlags = PARENB | PARODD | CMSPAR;

/// What a freshly opened terminal has: cooked, 38400 8N1.
termios cooked() {
    termios found{};
    found.c_iflag = ICRNL | IXON;
    found.c_oflag = OPOST | ONLCR;
    found.c_lflag = ICANON | ECHO | ISIG | IEXTEN;
    found.c_cflag = CS8 | CREAD | HUPCL | B38400;
    ::cfsetospeed(&found, B38400);
    ::cfsetispeed(&found, B38400);
    return found;
}

struct SpeedRow {
    int baud;
    speed_t code;
};

TEST(SerialSettingsTest, ListedRatesHaveTheirCodes) {
    constexpr SpeedRow kRows[] = {
        {150, B150},     {300, B300},     {600, B600},       {1200, B1200},
        {2400, B2400},   {4800, B4800},   {9600, B9600},     {19200, B19200},
        {38400, B38400}, {57600, B57600}, {115200, B115200},
    };
    for (const SpeedRow& row : kRows) {
        ASSERT_TRUE(speedOf(row.baud).has_value()) << row.baud;
        EXPECT_EQ(row.code, *speedOf(row.baud)) << row.baud;
        const termios raw = rawTermios(cooked(), {row.baud, 0, 8, 1, 0});
        EXPECT_EQ(row.code, ::cfgetospeed(&raw)) << row.baud;
        EXPECT_EQ(row.code, ::cfgetispeed(&raw)) << row.baud;
    }
}

TEST(SerialSettingsTest, UnlistedRatesAreRefused) {
    for (const int baud : {0, -9600, 1, 110, 149, 9601, 14400, 230400}) {
        EXPECT_EQ(std::nullopt, speedOf(baud)) << baud;
        EXPECT_EQ("baud rate " + std::to_string(baud) + " is not supported",
                  settingsFault({baud, 0, 8, 1, 0}));
    }
}

TEST(SerialSettingsTest, FaultsNameTheirValue) {
    EXPECT_EQ("", settingsFault({9600, 0, 8, 1, 0}));
    EXPECT_EQ("parity code -1 is not supported", settingsFault({9600, -1, 8, 1, 0}));
    EXPECT_EQ("parity code 5 is not supported", settingsFault({9600, 5, 8, 1, 0}));
    EXPECT_EQ("number of data bits 6 is not supported", settingsFault({9600, 0, 6, 1, 0}));
    EXPECT_EQ("number of data bits 9 is not supported", settingsFault({9600, 0, 9, 1, 0}));
    EXPECT_EQ("number of stop bits 0 is not supported", settingsFault({9600, 0, 8, 0, 0}));
    EXPECT_EQ("number of stop bits 3 is not supported", settingsFault({9600, 0, 8, 3, 0}));
    EXPECT_EQ("mode code -1 is not supported", settingsFault({9600, 0, 8, 1, -1}));
    EXPECT_EQ("mode code 4 is not supported", settingsFault({9600, 0, 8, 1, 4}));
}

TEST(SerialSettingsTest, ParityCodesHaveTheirFlags) {
    constexpr tcflag_t kFlags[] = {0, PARENB, PARENB | PARODD, PARENB | PARODD | CMSPAR,
                                   PARENB | CMSPAR};
    for (int code = 0; code < 5; ++code) {
        const termios raw = rawTermios(cooked(), {9600, code, 8, 1, 0});
        EXPECT_EQ(kFlags[code], raw.c_cflag & kParityFlags) << code;
        EXPECT_EQ(code != 0, (raw.c_iflag & INPCK) != 0) << code;
    }
}

TEST(SerialSettingsTest, EarlierParityDoesNotShineThrough) {
    const termios odd = rawTermios(cooked(), {9600, 3, 7, 2, 0});
    const termios none = rawTermios(odd, {9600, 0, 8, 1, 0});
    EXPECT_EQ(0u, none.c_cflag & (kParityFlags | CSTOPB));
    EXPECT_EQ(static_cast<tcflag_t>(CS8), none.c_cflag & static_cast<tcflag_t>(CSIZE));
}

TEST(SerialSettingsTest, DataAndStopBits) {
    const termios raw = rawTermios(cooked(), {9600, 1, 7, 2, 0});
    EXPECT_EQ(static_cast<tcflag_t>(CS7), raw.c_cflag & static_cast<tcflag_t>(CSIZE));
    EXPECT_NE(raw.c_cflag & CSTOPB, 0u);
}

TEST(SerialSettingsTest, NothingTouchesTheBytesOnTheirWay) {
    const termios raw = rawTermios(cooked(), {9600, 0, 8, 1, 0});
    EXPECT_EQ(0u, raw.c_lflag);
    EXPECT_EQ(0u, raw.c_oflag);
    EXPECT_EQ(static_cast<tcflag_t>(IGNBRK), raw.c_iflag);
    EXPECT_EQ(0u, raw.c_cflag & static_cast<tcflag_t>(CRTSCTS));
    EXPECT_NE(raw.c_cflag & CLOCAL, 0u);
    EXPECT_NE(raw.c_cflag & CREAD, 0u);
    EXPECT_EQ(1, raw.c_cc[VMIN]);
    EXPECT_EQ(0, raw.c_cc[VTIME]);
}

TEST(SerialSettingsTest, CharacterBitsCountEverythingOnTheWire) {
    EXPECT_EQ(10, characterBits({9600, 0, 8, 1, 0}));
    EXPECT_EQ(11, characterBits({9600, 1, 8, 1, 0}));
    EXPECT_EQ(11, characterBits({9600, 4, 7, 2, 0}));
    EXPECT_EQ(12, characterBits({9600, 2, 8, 2, 0}));
}

TEST(SerialSettingsTest, DriverThatIgnoresAFieldIsFoundOut) {
    const termios asked = rawTermios(cooked(), {9600, 3, 7, 2, 0});
    EXPECT_EQ("", differenceIn(asked, asked, false));

    termios taken = asked;
    taken.c_cflag &= ~static_cast<tcflag_t>(CMSPAR);
    EXPECT_EQ("parity was not accepted", differenceIn(asked, taken, false));
    EXPECT_EQ("", differenceIn(asked, taken, true));

    taken = asked;
    taken.c_cflag |= CS8;
    EXPECT_EQ("data bits were not accepted", differenceIn(asked, taken, false));
    EXPECT_EQ("", differenceIn(asked, taken, true));

    taken = asked;
    taken.c_cflag &= ~static_cast<tcflag_t>(CSTOPB);
    EXPECT_EQ("stop bits were not accepted", differenceIn(asked, taken, true));

    taken = asked;
    ::cfsetospeed(&taken, B4800);
    EXPECT_EQ("baud rate was not accepted", differenceIn(asked, taken, true));

    taken = asked;
    taken.c_lflag |= ECHO;
    EXPECT_EQ("raw transfer was not accepted", differenceIn(asked, taken, true));
}

TEST(SerialSettingsTest, DirectionControlFollowsTheMode) {
    serial_rs485 found;
    std::memset(&found, 0, sizeof found);
    found.flags = SER_RS485_RTS_AFTER_SEND;
    found.delay_rts_after_send = 3;
    for (const int mode : {1, 3}) {
        const serial_rs485 on = rs485For(found, mode);
        EXPECT_TRUE(isHalfDuplex(mode)) << mode;
        EXPECT_EQ(unsigned{SER_RS485_ENABLED | SER_RS485_RTS_ON_SEND}, on.flags) << mode;
        EXPECT_EQ(3u, on.delay_rts_after_send) << mode;
    }
    found.flags = SER_RS485_ENABLED | SER_RS485_RTS_ON_SEND;
    for (const int mode : {0, 2}) {
        EXPECT_FALSE(isHalfDuplex(mode)) << mode;
        EXPECT_EQ(0u, rs485For(found, mode).flags & SER_RS485_ENABLED) << mode;
    }
}

}  // namespace
