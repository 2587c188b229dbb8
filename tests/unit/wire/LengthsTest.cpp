#include <gtest/gtest.h>

#include "wire/FunctionCodes.h"
#include "wire/Lengths.h"

namespace {

using wire::Bytes;
using Length = std::optional<std::size_t>;

/// The first bytes of a request to node 1 at address 9, count or value 1.
Bytes requestOf(std::uint8_t function) {
    return {1, function, 0, 9, 0, 1};
}

TEST(LengthsTest, ReadsAndSingleWritesHaveEightBytes) {
    for (const std::uint8_t function : Bytes{1, 2, 3, 4, 5, 6}) {
        EXPECT_EQ(Length(8), wire::lengthOfRequest(requestOf(function), false)) << +function;
    }
}

TEST(LengthsTest, AWriteOfALongRegisterHasTwoBytesMore) {
    EXPECT_EQ(Length(10), wire::lengthOfRequest(requestOf(6), true));
    EXPECT_EQ(Length(8), wire::lengthOfRequest(requestOf(3), true));
    EXPECT_EQ(Length(8), wire::lengthOfRequest(requestOf(5), true));
}

TEST(LengthsTest, WritesOfSeveralTellTheirLengthByTheByteCount) {
    for (const std::uint8_t function : Bytes{15, 16}) {
        Bytes request = requestOf(function);
        EXPECT_EQ(std::nullopt, wire::lengthOfRequest(request, false)) << +function;
        request.push_back(2);
        EXPECT_EQ(Length(11), wire::lengthOfRequest(request, false)) << +function;
    }
}

TEST(LengthsTest, WithoutAnAddressOrWithAnUnknownFunctionThereIsNone) {
    EXPECT_EQ(std::nullopt, wire::lengthOfRequest({}, false));
    EXPECT_EQ(std::nullopt, wire::lengthOfRequest(Bytes{1, 3, 0}, false));
    EXPECT_EQ(std::nullopt, wire::lengthOfRequest(requestOf(7), false));
    EXPECT_EQ(std::nullopt, wire::addressOfRequest(Bytes{1, 3, 0}));
    EXPECT_EQ(std::optional<std::uint16_t>(0x0109),
              wire::addressOfRequest(Bytes{1, 3, 0x01, 0x09}));
}

TEST(LengthsTest, EveryFunctionOfTheTableHasALength) {
    for (const wire::FunctionRow& row : wire::kFunctions) {
        Bytes request = requestOf(row.code);
        request.push_back(0);
        EXPECT_NE(std::nullopt, wire::lengthOfRequest(request, false)) << +row.code;
    }
}

}  // namespace
