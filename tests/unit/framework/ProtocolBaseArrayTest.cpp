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

TEST(ProtocolBaseArrayTest, ItemIsCutOutOfTheWholeArray) {
    TestProtocol protocol;
    protocol.device = {1, 2, 3, 4, 5, 6};
    const TestTag tag("1", kThreeShorts);
    for (int index : {0, 1, 2}) {
        unsigned char item[3] = {0xEE, 0xEE, 0xEE};
        EXPECT_NE(protocol.readArrayItem(&tag, index, item), 0) << index;
        EXPECT_EQ(2 * index + 1, item[0]) << index;
        EXPECT_EQ(2 * index + 2, item[1]) << index;
        EXPECT_EQ(0xEE, item[2]) << index;
    }
    EXPECT_EQ((std::vector<int>{6, 6, 6}), protocol.readLengths);
}

TEST(ProtocolBaseArrayTest, WrittenItemTravelsWithTheWholeArray) {
    TestProtocol protocol;
    protocol.device = {1, 2, 3, 4, 5, 6};
    const TestTag tag("1", kThreeShorts);
    const unsigned char item[] = {0xAA, 0xBB};
    EXPECT_NE(protocol.writeArrayItem(&tag, 1, item), 0);
    ASSERT_EQ(1u, protocol.written.size());
    EXPECT_EQ((Bytes{1, 2, 0xAA, 0xBB, 5, 6}), protocol.written[0]);
}

TEST(ProtocolBaseArrayTest, ItemsOfLongArraysAreReachedToTheLast) {
    for (int length : {255, 256, 257, 1000}) {
        TestProtocol protocol;
        protocol.device.resize(static_cast<std::size_t>(length));
        std::iota(protocol.device.begin(), protocol.device.end(), static_cast<unsigned char>(0));
        const TestTag tag("1", bytesShape(length));
        unsigned char item = 0xEE;
        EXPECT_NE(protocol.readArrayItem(&tag, length - 1, &item), 0) << length;
        EXPECT_EQ(protocol.device.back(), item) << length;

        Bytes expected = protocol.device;
        expected.back() = 0x77;
        item = 0x77;
        EXPECT_NE(protocol.writeArrayItem(&tag, length - 1, &item), 0) << length;
        ASSERT_EQ(1u, protocol.written.size()) << length;
        EXPECT_EQ(expected, protocol.written[0]) << length;
    }
}

TEST(ProtocolBaseArrayTest, BitItemsAreOneByteEach) {
    TestProtocol protocol;
    protocol.device = {0b00010100};
    const TestTag tag("1", {ICU_Type::booleanArray, ICU_Type::boolean, 4, 0, 2});
    unsigned char item = 0xEE;
    EXPECT_NE(protocol.readArrayItem(&tag, 2, &item), 0);
    EXPECT_EQ(1, item);
    EXPECT_NE(protocol.readArrayItem(&tag, 3, &item), 0);
    EXPECT_EQ(0, item);

    item = 1;
    EXPECT_NE(protocol.writeArrayItem(&tag, 3, &item), 0);
    ASSERT_EQ(1u, protocol.written.size());
    EXPECT_EQ((Bytes{1, 0, 1, 1}), protocol.written[0]);
}

TEST(ProtocolBaseArrayTest, ScalarsHaveNoItems) {
    TestProtocol protocol;
    const TestTag tag("1", {ICU_Type::short_, ICU_Type::none, 2});
    unsigned char item[2] = {0xEE, 0xEE};
    // The missing array is reported even where the index is wrong too.
    for (int index : {0, -1, 99}) {
        protocol.SetError(1, "");
        EXPECT_EQ(0, protocol.readArrayItem(&tag, index, item)) << index;
        EXPECT_EQ(-1, protocol.GetLastError());
        EXPECT_STREQ(kNoArray, protocol.GetLastErrorString()) << index;
        protocol.SetError(1, "");
        EXPECT_EQ(0, protocol.writeArrayItem(&tag, index, item)) << index;
        EXPECT_EQ(-1, protocol.GetLastError());
        EXPECT_STREQ(kNoArray, protocol.GetLastErrorString()) << index;
    }
    EXPECT_EQ(0xEE, item[0]);
    EXPECT_TRUE(protocol.readLengths.empty());
    EXPECT_TRUE(protocol.written.empty());
}

TEST(ProtocolBaseArrayTest, IndexOutsideTheArrayReachesNoDevice) {
    TestProtocol protocol;
    const TestTag tag("1", kThreeShorts);
    unsigned char item[2] = {0xEE, 0xEE};
    for (int index : {-1, 3, 4, -2147483647 - 1, 2147483647}) {
        protocol.SetError(1, "");
        EXPECT_EQ(0, protocol.readArrayItem(&tag, index, item)) << index;
        EXPECT_EQ(-1, protocol.GetLastError());
        EXPECT_STREQ(kOutOfRange, protocol.GetLastErrorString()) << index;
        protocol.SetError(1, "");
        EXPECT_EQ(0, protocol.writeArrayItem(&tag, index, item)) << index;
        EXPECT_STREQ(kOutOfRange, protocol.GetLastErrorString()) << index;
    }
    EXPECT_EQ(0xEE, item[0]);
    EXPECT_TRUE(protocol.readLengths.empty());
    EXPECT_TRUE(protocol.written.empty());
}

TEST(ProtocolBaseArrayTest, EmptyAndNegativeArraysHaveNoItems) {
    TestProtocol protocol;
    unsigned char item = 0xEE;
    for (int length : {0, -1, -300}) {
        const TestTag tag("1", bytesShape(length));
        EXPECT_EQ(0, protocol.readArrayItem(&tag, 0, &item)) << length;
        EXPECT_EQ(0, protocol.writeArrayItem(&tag, 0, &item)) << length;
        EXPECT_STREQ(kOutOfRange, protocol.GetLastErrorString()) << length;
    }
    EXPECT_EQ(0xEE, item);
}

TEST(ProtocolBaseArrayTest, FailedReadStopsBothReadAndWrite) {
    TestProtocol protocol;
    protocol.readResult = 0;
    const TestTag tag("1", kThreeShorts);
    unsigned char item[2] = {0xEE, 0xEE};
    EXPECT_EQ(0, protocol.readArrayItem(&tag, 1, item));
    EXPECT_EQ(0xEE, item[0]);
    EXPECT_EQ(0, protocol.writeArrayItem(&tag, 1, item));
    EXPECT_TRUE(protocol.written.empty());
    EXPECT_STREQ("nobody answered the read", protocol.GetLastErrorString());
}

TEST(ProtocolBaseArrayTest, FailedWriteIsReported) {
    TestProtocol protocol;
    protocol.writeResult = 0;
    const TestTag tag("1", kThreeShorts);
    const unsigned char item[2] = {1, 2};
    EXPECT_EQ(0, protocol.writeArrayItem(&tag, 1, item));
    EXPECT_STREQ("nobody answered the write", protocol.GetLastErrorString());
}

}  // namespace
