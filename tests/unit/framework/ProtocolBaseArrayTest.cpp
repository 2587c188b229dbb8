// Single items of array tags.
#include <gtest/gtest.h>

#include <numeric>
#include <vector>

#include "tests/unit/framework/TestProtocol.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr const char* kNoArray = "accessing an array item where the tag is not array";
constexpr const char* kOutOfRange = "accessing array item out of range";

const TagShape kThreeShorts{ICU_Type::shortArray, ICU_Type::short_, 6};

TEST(ProtocolBaseArray, ItemIsCutOutOfTheWholeArray) {
    TestProtocol protocol;
    protocol.device = {1, 2, 3, 4, 5, 6};
    const TestTag tag("1", kThreeShorts);
    for (int index : {0, 1, 2}) {
        unsigned char item[3] = {0xEE, 0xEE, 0xEE};
        EXPECT_NE(protocol.readArrayItem(&tag, index, item), 0) << index;
        EXPECT_EQ(item[0], 2 * index + 1) << index;
        EXPECT_EQ(item[1], 2 * index + 2) << index;
        EXPECT_EQ(item[2], 0xEE) << index;
    }
    EXPECT_EQ(protocol.readLengths, (std::vector<int>{6, 6, 6}));
}

TEST(ProtocolBaseArray, WrittenItemTravelsWithTheWholeArray) {
    TestProtocol protocol;
    protocol.device = {1, 2, 3, 4, 5, 6};
    const TestTag tag("1", kThreeShorts);
    const unsigned char item[] = {0xAA, 0xBB};
    EXPECT_NE(protocol.writeArrayItem(&tag, 1, item), 0);
    ASSERT_EQ(protocol.written.size(), 1u);
    EXPECT_EQ(protocol.written[0], (Bytes{1, 2, 0xAA, 0xBB, 5, 6}));
}

TEST(ProtocolBaseArray, ItemsOfLongArraysAreReachedToTheLast) {
    for (int length : {255, 256, 257, 1000}) {
        TestProtocol protocol;
        protocol.device.resize(static_cast<std::size_t>(length));
        std::iota(protocol.device.begin(), protocol.device.end(), static_cast<unsigned char>(0));
        const TestTag tag("1", bytesShape(length));
        unsigned char item = 0xEE;
        EXPECT_NE(protocol.readArrayItem(&tag, length - 1, &item), 0) << length;
        EXPECT_EQ(item, protocol.device.back()) << length;

        Bytes expected = protocol.device;
        expected.back() = 0x77;
        item = 0x77;
        EXPECT_NE(protocol.writeArrayItem(&tag, length - 1, &item), 0) << length;
        ASSERT_EQ(protocol.written.size(), 1u) << length;
        EXPECT_EQ(protocol.written[0], expected) << length;
    }
}

TEST(ProtocolBaseArray, BitItemsAreOneByteEach) {
    TestProtocol protocol;
    protocol.device = {0b00010100};
    const TestTag tag("1", {ICU_Type::booleanArray, ICU_Type::boolean, 4, 0, 2});
    unsigned char item = 0xEE;
    EXPECT_NE(protocol.readArrayItem(&tag, 2, &item), 0);
    EXPECT_EQ(item, 1);
    EXPECT_NE(protocol.readArrayItem(&tag, 3, &item), 0);
    EXPECT_EQ(item, 0);

    item = 1;
    EXPECT_NE(protocol.writeArrayItem(&tag, 3, &item), 0);
    ASSERT_EQ(protocol.written.size(), 1u);
    EXPECT_EQ(protocol.written[0], (Bytes{1, 0, 1, 1}));
}

TEST(ProtocolBaseArray, ScalarsHaveNoItems) {
    TestProtocol protocol;
    const TestTag tag("1", {ICU_Type::short_, ICU_Type::none, 2});
    unsigned char item[2] = {0xEE, 0xEE};
    // The missing array is reported even where the index is wrong too.
    for (int index : {0, -1, 99}) {
        protocol.SetError(1, "");
        EXPECT_EQ(protocol.readArrayItem(&tag, index, item), 0) << index;
        EXPECT_EQ(protocol.GetLastError(), -1);
        EXPECT_STREQ(protocol.GetLastErrorString(), kNoArray) << index;
        protocol.SetError(1, "");
        EXPECT_EQ(protocol.writeArrayItem(&tag, index, item), 0) << index;
        EXPECT_EQ(protocol.GetLastError(), -1);
        EXPECT_STREQ(protocol.GetLastErrorString(), kNoArray) << index;
    }
    EXPECT_EQ(item[0], 0xEE);
    EXPECT_TRUE(protocol.readLengths.empty());
    EXPECT_TRUE(protocol.written.empty());
}

TEST(ProtocolBaseArray, IndexOutsideTheArrayReachesNoDevice) {
    TestProtocol protocol;
    const TestTag tag("1", kThreeShorts);
    unsigned char item[2] = {0xEE, 0xEE};
    for (int index : {-1, 3, 4, -2147483647 - 1, 2147483647}) {
        protocol.SetError(1, "");
        EXPECT_EQ(protocol.readArrayItem(&tag, index, item), 0) << index;
        EXPECT_EQ(protocol.GetLastError(), -1);
        EXPECT_STREQ(protocol.GetLastErrorString(), kOutOfRange) << index;
        protocol.SetError(1, "");
        EXPECT_EQ(protocol.writeArrayItem(&tag, index, item), 0) << index;
        EXPECT_STREQ(protocol.GetLastErrorString(), kOutOfRange) << index;
    }
    EXPECT_EQ(item[0], 0xEE);
    EXPECT_TRUE(protocol.readLengths.empty());
    EXPECT_TRUE(protocol.written.empty());
}

TEST(ProtocolBaseArray, EmptyAndNegativeArraysHaveNoItems) {
    TestProtocol protocol;
    unsigned char item = 0xEE;
    for (int length : {0, -1, -300}) {
        const TestTag tag("1", bytesShape(length));
        EXPECT_EQ(protocol.readArrayItem(&tag, 0, &item), 0) << length;
        EXPECT_EQ(protocol.writeArrayItem(&tag, 0, &item), 0) << length;
        EXPECT_STREQ(protocol.GetLastErrorString(), kOutOfRange) << length;
    }
    EXPECT_EQ(item, 0xEE);
}

TEST(ProtocolBaseArray, FailedReadStopsBothReadAndWrite) {
    TestProtocol protocol;
    protocol.readResult = 0;
    const TestTag tag("1", kThreeShorts);
    unsigned char item[2] = {0xEE, 0xEE};
    EXPECT_EQ(protocol.readArrayItem(&tag, 1, item), 0);
    EXPECT_EQ(item[0], 0xEE);
    EXPECT_EQ(protocol.writeArrayItem(&tag, 1, item), 0);
    EXPECT_TRUE(protocol.written.empty());
    EXPECT_STREQ(protocol.GetLastErrorString(), "nobody answered the read");
}

TEST(ProtocolBaseArray, FailedWriteIsReported) {
    TestProtocol protocol;
    protocol.writeResult = 0;
    const TestTag tag("1", kThreeShorts);
    const unsigned char item[2] = {1, 2};
    EXPECT_EQ(protocol.writeArrayItem(&tag, 1, item), 0);
    EXPECT_STREQ(protocol.GetLastErrorString(), "nobody answered the write");
}

}  // namespace
