// Device images read through the engine.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr unsigned char kUntouched = 0xA5;

class ReadBlockTest : public testing::Test {
  protected:
    // A guard byte behind the buffer shows a write past its end.
    Bytes read(const std::string& uri, int length) {
        Bytes data(static_cast<std::size_t>(length) + 1, kUntouched);
        EXPECT_NE(driver_.ReadBlock(driver_.tag(uri), data.data(), length), 0)
            << uri << ": " << driver_.GetLastErrorString();
        EXPECT_EQ(kUntouched, data.back()) << uri;
        data.pop_back();
        return data;
    }

    FakeDriver driver_;
};

}  // namespace

TEST_F(ReadBlockTest, AnyLengthBeginsWithTheTagsFirstItem) {
    for (const char* memory : {"REG", "LONG", "BYTE"}) {
        for (const int length : {1, 2, 3, 4, 5, 247, 248, 249, 250, 251, 252, 501, 1003}) {
            const std::string uri = std::string("1?") + memory + "?33?short";
            EXPECT_EQ(driver_.memory(memory).bytes(33, length), read(uri, length))
                << uri << " length " << length;
        }
    }
}

TEST_F(ReadBlockTest, PartOfTheLastItemIsReadWhole) {
    read("1?REG?33?short", 5);
    EXPECT_EQ("read 33+3", driver_.calls());
}

TEST_F(ReadBlockTest, FailureInAnyBlockLeavesTheBuffer) {
    for (const int length : {500, 501}) {
        for (int call = 1; call <= 2; ++call) {
            Bytes data(static_cast<std::size_t>(length), kUntouched);
            driver_.failCall(call);
            EXPECT_EQ(0, driver_.ReadBlock(driver_.tag("1?REG?33?short"), data.data(), length));
            EXPECT_EQ(Bytes(data.size(), kUntouched), data) << length << " call " << call;
        }
    }
}

TEST_F(ReadBlockTest, UnusableLengthsAreRefused) {
    struct Row {
        const char* uri;
        int length;
        const char* text;
    };
    constexpr Row kRows[] = {
        {"1?REG?33?short", 0, "Tag length is not positive"},
        {"1?REG?33?short", -5, "Tag length is not positive"},
        {"1?COIL?33?boolean", 0, "Tag length is not positive"},
        {"1?REG?65534?short", 5, "Tag exceeds the memory area"},
        {"1?COIL?65528?boolean", 2, "Tag exceeds the memory area"},
        {"1?REG?33?short", 2147483647, "Tag exceeds the memory area"},
        {"1?COIL?33?boolean", 2147483647, "Tag exceeds the memory area"},
        {"1?AREA?0?unsignedInt", 2147483647, "Tag exceeds the memory area"},
    };
    for (const Row& row : kRows) {
        unsigned char data = kUntouched;
        EXPECT_EQ(0, driver_.ReadBlock(driver_.tag(row.uri), &data, row.length)) << row.uri;
        EXPECT_EQ(-1, driver_.GetLastError()) << row.uri;
        EXPECT_STREQ(row.text, driver_.GetLastErrorString()) << row.uri << " " << row.length;
        EXPECT_EQ(kUntouched, data) << row.uri;
    }
    EXPECT_EQ("", driver_.calls());
}

TEST_F(ReadBlockTest, BitMemoryDeliversTheTagsOwnBits) {
    Bytes data(2, 0);
    ASSERT_NE(driver_.ReadBlock(driver_.tag("1?COIL?21?boolean-10"), data.data(), 2), 0);
    EXPECT_EQ("readBits 21+10", driver_.calls());
    for (int i = 0; i < 10; ++i) {
        const int bit = data[static_cast<std::size_t>((5 + i) / 8)] >> ((5 + i) % 8) & 1;
        EXPECT_EQ(driver_.memory("COIL").bit(21 + i), bit) << i;
    }
}

TEST_F(ReadBlockTest, BitMemoryFillsLongerBuffersToTheLastBit) {
    Bytes data(3, 0);
    ASSERT_NE(driver_.ReadBlock(driver_.tag("1?COIL?21?boolean"), data.data(), 3), 0);
    EXPECT_EQ("readBits 21+19", driver_.calls());
}

TEST_F(ReadBlockTest, BitBlockLandsAtTheOffsetsBitAndSparesTheOthers) {
    for (const int limit : {2000, 7}) {
        driver_.setLimit(limit);
        for (int offset = 16; offset < 24; ++offset) {
            Bytes data(4, kUntouched);
            const std::string uri = "1?COIL?" + std::to_string(offset) + "?boolean-17";
            ASSERT_NE(driver_.ReadBitBlock(driver_.tag(uri), data.data(), 17), 0);
            for (int k = 0; k < 32; ++k) {
                const int bit = data[static_cast<std::size_t>(k / 8)] >> (k % 8) & 1;
                const bool inside = k >= offset % 8 && k < offset % 8 + 17;
                const int expected =
                    inside ? driver_.memory("COIL").bit(16 + k) : kUntouched >> (k % 8) & 1;
                EXPECT_EQ(expected, bit) << "offset " << offset << " bit " << k;
            }
        }
    }
}

TEST_F(ReadBlockTest, BitBlockFailureInTheSecondRequestLeavesTheBuffer) {
    driver_.setLimit(10);
    driver_.failCall(2);
    Bytes data(4, kUntouched);
    EXPECT_EQ(0, driver_.ReadBitBlock(driver_.tag("1?COIL?3?boolean"), data.data(), 20));
    EXPECT_EQ(Bytes(4, kUntouched), data);
    EXPECT_EQ("readBits 3+10, readBits 13+10", driver_.calls());
}

TEST_F(ReadBlockTest, RegistersHaveNoBitBlocks) {
    unsigned char data = kUntouched;
    EXPECT_EQ(0, driver_.ReadBitBlock(driver_.tag("1?REG?3?boolean"), &data, 1));
    EXPECT_EQ(-3, driver_.GetLastError());
    EXPECT_STREQ("Bit blocks not supported", driver_.GetLastErrorString());
    EXPECT_EQ(kUntouched, data);
}
