// Device images written through the engine.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

using Bytes = std::vector<unsigned char>;

class WriteBlockTest : public testing::Test {
  protected:
    static Bytes image(int length) {
        Bytes bytes;
        for (int i = 0; i < length; ++i)
            bytes.push_back(static_cast<unsigned char>(i * 11 + 5));
        return bytes;
    }

    FakeDriver driver_;
};

}  // namespace

TEST_F(WriteBlockTest, AnyLengthChangesItsOwnBytesOnly) {
    for (const char* memory : {"REG", "LONG", "BYTE"}) {
        FakeMemory& area = driver_.memory(memory);
        for (const int length : {1, 2, 3, 4, 5, 243, 244, 245, 246, 247, 248, 501, 1003}) {
            FakeMemory expected = area;
            const Bytes bytes = image(length);
            expected.setBytes(33, bytes);
            const ITag* tag = driver_.tag(std::string("1?") + memory + "?33?short");
            EXPECT_NE(driver_.WriteBlock(tag, bytes.data(), length), 0) << memory << length;
            EXPECT_TRUE(area.image() == expected.image()) << memory << " length " << length;
        }
    }
}

TEST_F(WriteBlockTest, OnlyAPartialLastItemIsAReasonToRead) {
    const Bytes bytes = image(4);
    const ITag* tag = driver_.tag("1?REG?33?short");
    EXPECT_NE(driver_.WriteBlock(tag, bytes.data(), 4), 0);
    EXPECT_EQ("write 33+2", driver_.calls());
    EXPECT_NE(driver_.WriteBlock(tag, bytes.data(), 3), 0);
    EXPECT_EQ("read 33+2, write 33+2", driver_.calls());
}

TEST_F(WriteBlockTest, NothingIsWrittenWhenTheReadFails) {
    const Bytes before = driver_.memory("REG").image();
    driver_.failCall(1);
    EXPECT_EQ(0, driver_.WriteBlock(driver_.tag("1?REG?33?short"), image(3).data(), 3));
    EXPECT_EQ(-4, driver_.GetLastError());
    EXPECT_TRUE(driver_.memory("REG").image() == before);
    EXPECT_EQ("read 33+2", driver_.calls());
}

TEST_F(WriteBlockTest, AreaOfTheDriverItselfIsNeverReadFirst) {
    EXPECT_NE(driver_.WriteBlock(driver_.tag("1?AREA?0?unsignedInt"), image(3).data(), 3), 0);
    EXPECT_EQ("write 0+1", driver_.calls());
    EXPECT_EQ((Bytes{5, 16, 27, 0}), driver_.memory("AREA").bytes(0, 4));
}

TEST_F(WriteBlockTest, UnusableBlocksAreRefused) {
    struct Row {
        const char* uri;
        int length;
        const char* text;
    };
    constexpr Row kRows[] = {
        {"1?REG?33?short", 0, "Tag length is not positive"},
        {"1?REG?33?short", -2, "Tag length is not positive"},
        {"1?COIL?33?boolean", 0, "Tag length is not positive"},
        {"1?REG?65534?short", 5, "Tag exceeds the memory area"},
        {"1?COIL?65528?boolean", 2, "Tag exceeds the memory area"},
        {"1?IREG?33?short", 2, "Memory type is read only"},
    };
    const Bytes bytes = image(8);
    for (const Row& row : kRows) {
        EXPECT_EQ(0, driver_.WriteBlock(driver_.tag(row.uri), bytes.data(), row.length)) << row.uri;
        EXPECT_EQ(-1, driver_.GetLastError()) << row.uri;
        EXPECT_STREQ(row.text, driver_.GetLastErrorString()) << row.uri << " " << row.length;
    }
    EXPECT_EQ("", driver_.calls());
}

TEST_F(WriteBlockTest, BitMemoryTakesTheTagsOwnBits) {
    const Bytes bytes = image(2);
    EXPECT_NE(driver_.WriteBlock(driver_.tag("1?COIL?21?boolean-10"), bytes.data(), 2), 0);
    EXPECT_EQ("writeBits 21+10", driver_.calls());
    for (int i = 0; i < 10; ++i) {
        const int bit = bytes[static_cast<size_t>((5 + i) / 8)] >> ((5 + i) % 8) & 1;
        EXPECT_EQ(bit, driver_.memory("COIL").bit(21 + i)) << i;
    }
}

TEST_F(WriteBlockTest, BitBlockIsTakenFromTheOffsetsBitOn) {
    const Bytes bytes = image(8);
    for (const int limit : {1968, 7}) {
        driver_.setLimit(limit);
        for (int offset = 16; offset < 24; ++offset) {
            FakeMemory expected = driver_.memory("COIL");
            for (int i = 0; i < 17; ++i) {
                const int source = offset % 8 + i;
                const int bit = bytes[static_cast<size_t>(source / 8)] >> (source % 8) & 1;
                expected.setBit(offset + i, static_cast<unsigned char>(bit));
            }
            const ITag* tag = driver_.tag("1?COIL?" + std::to_string(offset) + "?boolean");
            EXPECT_NE(driver_.WriteBitBlock(tag, bytes.data(), 17), 0);
            EXPECT_TRUE(driver_.memory("COIL").image() == expected.image()) << offset;
        }
    }
}

TEST_F(WriteBlockTest, BitBlocksBelongToBitMemories) {
    const unsigned char byte = 1;
    EXPECT_EQ(0, driver_.WriteBitBlock(driver_.tag("1?REG?3?boolean"), &byte, 1));
    EXPECT_EQ(-3, driver_.GetLastError());
    EXPECT_STREQ("Bit blocks not supported", driver_.GetLastErrorString());
    EXPECT_EQ("", driver_.calls());
}
