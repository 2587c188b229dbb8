// Values written through the text console.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/unit/framework/ConsoleFixture.h"

namespace {

using Bytes = std::vector<unsigned char>;
using ConsoleWriteTest = ConsoleTest;

constexpr const char* kNoUriOrData = "error: missing parameters (URI string + data)\n";
constexpr const char* kWrongLength = "error: incorrect length of data to write\n";
constexpr const char* kWrongDigits = "error: incorrect hex data\n";

TEST_F(ConsoleWriteTest, WriteNeedsExactlyUriAndData) {
    for (const char* command :
         {"write", "write byte", "write byte 00 00", "write byte  00", "write byte 00 "}) {
        EXPECT_EQ(kNoUriOrData, answerTo(command)) << '"' << command << '"';
    }
    EXPECT_TRUE(protocol_.written.empty());
}

TEST_F(ConsoleWriteTest, WrittenDigitsAreHighNibbleFirstInEitherCase) {
    EXPECT_EQ("written ok\n", answerTo("write dword 1aB2c3D4"));
    EXPECT_EQ("written ok\n", answerTo("write bits 010001"));
    const std::vector<Bytes> expected{{0x1A, 0xB2, 0xC3, 0xD4}, {1, 0, 1}};
    EXPECT_EQ(expected, protocol_.written);
}

TEST_F(ConsoleWriteTest, LongValuesAreWrittenWhole) {
    for (std::size_t length : {64u, 65u}) {
        std::string digits;
        for (std::size_t i = 0; i < length; ++i)
            digits += i + 1 == length ? "7f" : "a5";
        EXPECT_EQ("written ok\n", answerTo("write b" + std::to_string(length) + " " + digits));
        Bytes expected(length, 0xA5);
        expected.back() = 0x7F;
        ASSERT_FALSE(protocol_.written.empty());
        EXPECT_EQ(expected, protocol_.written.back());
    }
}

TEST_F(ConsoleWriteTest, WrongNumberOfDigitsIsRefused) {
    for (const char* data : {"001", "0", "00", "00000", "000000", "0x00f"}) {
        EXPECT_EQ(kWrongLength, answerTo(std::string("write word ") + data)) << data;
    }
    EXPECT_EQ(kWrongLength, answerTo("write nothing 00"));
    EXPECT_TRUE(protocol_.written.empty());
}

TEST_F(ConsoleWriteTest, WrongLengthIsReportedBeforeWrongDigits) {
    EXPECT_EQ(kWrongLength, answerTo("write word 0g0"));
}

TEST_F(ConsoleWriteTest, EmptyValueTakesEmptyData) {
    EXPECT_EQ("written ok\n", answerTo("write nothing "));
    EXPECT_EQ(std::vector<Bytes>{Bytes{}}, protocol_.written);
}

TEST_F(ConsoleWriteTest, OnlyHexadecimalDigitsAreTaken) {
    EXPECT_EQ(kWrongDigits, answerTo("write byte 0g"));
    const std::string digits = "0123456789ABCDEFabcdef";
    for (int code = 1; code < 256; ++code) {
        const char c = static_cast<char>(code);
        if (c == ' ' || c == '\t') continue;  // these end a word or are trimmed off it
        const bool isDigit = digits.find(c) != std::string::npos;
        const char* expected = isDigit ? "written ok\n" : kWrongDigits;
        EXPECT_EQ(expected, answerTo(std::string("write byte 0") + c)) << code;
        EXPECT_EQ(expected, answerTo(std::string("write byte ") + c + "0")) << code;
    }
    EXPECT_EQ(2 * digits.size(), protocol_.written.size());
}

TEST_F(ConsoleWriteTest, FailedWriteIsAnsweredWithTheLastError) {
    protocol_.writeResult = 0;
    EXPECT_EQ("nobody answered the write", answerTo("write byte 00"));
}

}  // namespace
