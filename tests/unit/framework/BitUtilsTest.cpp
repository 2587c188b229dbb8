#include "framework/BitUtils.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <vector>

#include "tests/unit/framework/ValueTag.h"

namespace {

using Bytes = std::vector<unsigned char>;
using Bits = std::vector<bool>;

// The model: a buffer is a row of bits.
Bits ToBits(const Bytes& bytes) {
    Bits bits;
    for (const unsigned char byte : bytes) {
        for (int bit = 0; bit < 8; ++bit)
            bits.push_back((byte >> bit) % 2 == 1);
    }
    return bits;
}

Bytes ToBytes(const Bits& bits) {
    Bytes bytes(bits.size() / 8);
    for (std::size_t i = 0; i < bits.size(); ++i) {
        if (bits[i]) bytes[i / 8] = static_cast<unsigned char>(bytes[i / 8] + (1 << (i % 8)));
    }
    return bytes;
}

std::size_t Index(int i) {
    return static_cast<std::size_t>(i);
}

// Both polarities around the copied range, and a pattern without a period of eight bits.
const Bytes kSource = {0x5A, 0xC3, 0x0F, 0x96, 0xE1};
const Bytes kBackgrounds[] = {Bytes(6, 0x00), Bytes(6, 0xFF), {0x33, 0xA5, 0x71, 0x0E, 0xD8, 0x6C}};
constexpr int kPositions = 17;
constexpr int kCounts = 20;

TEST(BitUtilsTest, GetLenOfBitsCountsTheBytesTouched) {
    struct Row {
        int start;
        int count;
        int bytes;
    };
    const Row rows[] = {
        {0, 8, 1},
        {7, 2, 2},
        {8, 16, 2},
        {3, 0, 1},
        {8, 0, 0},
        {0, 0, 1},
        {0, 1, 1},
        {0, 9, 2},
        {15, 1, 1},
        {7, 9, 2},
        {7, 10, 3},
        {16, 0, 0},
        {5, 3, 1},
        {5, 4, 2},
        {0, 2000, 250},
        {3, 2000, 251},
        {0, INT32_MAX, 268435456},
        {INT32_MAX, 9, 2},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(ProtUtilsN::GetLenOfBits(row.start, row.count), row.bytes)
            << row.start << ", " << row.count;
    }
}

TEST(BitUtilsTest, UnpackBitsMakesOneByteOfEachBit) {
    const Bytes packed = {0x05};
    Bytes bits(3, 0x77);
    ProtUtilsN::UnpackBits(bits.data(), packed.data(), 0, 3);
    EXPECT_EQ((Bytes{1, 0, 1}), bits);
}

TEST(BitUtilsTest, PackBitsCrossesFromTheLastBitOfAByteToTheFirstOfTheNext) {
    const Bytes values = {1, 1};
    Bytes packed = {0x00, 0x00};
    ProtUtilsN::PackBits(packed.data(), values.data(), 7, 2);
    EXPECT_EQ((Bytes{0x80, 0x01}), packed);
}

TEST(BitUtilsTest, PackBitsTakesAnyValueButZeroForOne) {
    const Bytes values = {2, 0, 0xFF, 0x80};
    Bytes packed = {0xF2};
    ProtUtilsN::PackBits(packed.data(), values.data(), 0, 4);
    EXPECT_EQ((Bytes{0xFD}), packed);
}

TEST(BitUtilsTest, CopyBitsKeepsThePositionWithinTheByte) {
    const Bytes source = {0x00, 0xFF, 0xFF};
    Bytes copy = {0x00, 0x00};
    ProtUtilsN::CopyBits(copy.data(), source.data(), 13, 4);
    EXPECT_EQ((Bytes{0xE0, 0x01}), copy);
}

TEST(BitUtilsTest, ACountBelowOneChangesNothing) {
    for (const int count : {0, -1, INT32_MIN}) {
        Bytes dst(3, 0xA5);
        ProtUtilsN::CopyBits(dst.data(), kSource.data(), 5, count);
        ProtUtilsN::UnpackBits(dst.data(), kSource.data(), 5, count);
        ProtUtilsN::PackBits(dst.data(), kSource.data(), 5, count);
        ProtUtilsN::shiftBits(dst.data(), 3, kSource.data(), 5, count);
        EXPECT_EQ(Bytes(3, 0xA5), dst) << count;
    }
}

TEST(BitUtilsTest, UnpackBitsAgreesWithTheModelEverywhere) {
    const Bits source = ToBits(kSource);
    for (int start = 0; start < kPositions; ++start) {
        for (int count = 0; count < kCounts; ++count) {
            Bytes dst(Index(count) + 2, 0x77);
            Bytes expected = dst;
            for (int i = 0; i < count; ++i)
                expected[Index(i) + 1] = source[Index(start + i)];
            ProtUtilsN::UnpackBits(dst.data() + 1, kSource.data(), start, count);
            ASSERT_EQ(expected, dst) << start << ", " << count;
        }
    }
}

TEST(BitUtilsTest, PackBitsAgreesWithTheModelEverywhere) {
    Bytes values;
    for (const bool bit : ToBits(kSource))
        values.push_back(bit ? 0x40 : 0);
    for (const Bytes& background : kBackgrounds) {
        for (int start = 0; start < kPositions; ++start) {
            for (int count = 0; count < kCounts; ++count) {
                Bytes dst = background;
                Bits expected = ToBits(background);
                for (int i = 0; i < count; ++i) {
                    expected[Index(8 + start + i)] = values[Index(i)] != 0;
                }
                ProtUtilsN::PackBits(dst.data() + 1, values.data(), start, count);
                ASSERT_EQ(ToBytes(expected), dst) << start << ", " << count;
            }
        }
    }
}

TEST(BitUtilsTest, CopyBitsAgreesWithTheModelEverywhere) {
    const Bits source = ToBits(kSource);
    for (const Bytes& background : kBackgrounds) {
        for (int start = 0; start < kPositions; ++start) {
            for (int count = 0; count < kCounts; ++count) {
                Bytes dst = background;
                Bits expected = ToBits(background);
                for (int i = 0; i < count; ++i) {
                    expected[Index(8 + start % 8 + i)] = source[Index(start + i)];
                }
                ProtUtilsN::CopyBits(dst.data() + 1, kSource.data(), start, count);
                ASSERT_EQ(ToBytes(expected), dst) << start << ", " << count;
            }
        }
    }
}

TEST(BitUtilsTest, ShiftBitsAgreesWithTheModelEverywhere) {
    const Bits source = ToBits(kSource);
    for (const Bytes& background : kBackgrounds) {
        for (int from = 0; from < kPositions; ++from) {
            for (int to = 0; to < kPositions; ++to) {
                for (int count = 0; count < kCounts; ++count) {
                    Bytes dst = background;
                    Bits expected = ToBits(background);
                    for (int i = 0; i < count; ++i) {
                        expected[Index(8 + to + i)] = source[Index(from + i)];
                    }
                    ProtUtilsN::shiftBits(dst.data() + 1, to, kSource.data(), from, count);
                    ASSERT_EQ(ToBytes(expected), dst) << from << " to " << to << ", " << count;
                }
            }
        }
    }
}

// The buffers end with the last bit's byte, so that a sanitizer sees any step beyond it.
TEST(BitUtilsTest, StayWithinTheBytesThatTheBitsTouch) {
    for (int start = 0; start < kPositions; ++start) {
        for (int count = 1; count < kCounts; ++count) {
            const auto bytes = Index((start + count + 7) / 8);
            const Bytes ones(bytes, 0xFF);
            Bytes values(Index(count), 0);
            Bytes packed(bytes, 0);
            Bytes copy(Index((start % 8 + count + 7) / 8), 0);
            ProtUtilsN::UnpackBits(values.data(), ones.data(), start, count);
            ProtUtilsN::PackBits(packed.data(), values.data(), start, count);
            ProtUtilsN::CopyBits(copy.data(), packed.data(), start, count);
            const Bits bits = ToBits(copy);
            ASSERT_EQ(count, std::count(bits.begin(), bits.end(), true)) << start;
        }
    }
}

TEST(BitUtilsTest, TagBitsLocateABitArray) {
    const ValueTag tag("boolean-10", 2, 3);
    EXPECT_EQ(19, ProtUtilsN::getStartingBit(&tag));
    EXPECT_EQ(29, ProtUtilsN::getEndingBit(&tag));
}

TEST(BitUtilsTest, TagBitsLocateASingleBit) {
    const ValueTag tag("boolean", 1, 7);
    EXPECT_EQ(15, ProtUtilsN::getStartingBit(&tag));
    EXPECT_EQ(16, ProtUtilsN::getEndingBit(&tag));
}

TEST(BitUtilsTest, TagBitsIgnoreTheBitIndexOfOtherTypes) {
    const ValueTag tag("int-3", 2, 5);
    EXPECT_EQ(16, ProtUtilsN::getStartingBit(&tag));
    EXPECT_EQ(16 + 12 * 8, ProtUtilsN::getEndingBit(&tag));
}

class RegisterTag : public ValueTag {
  public:
    using ValueTag::ValueTag;
    int PackedLen() const override { return 6; }
};

TEST(BitUtilsTest, TagBitsEndBehindTheDeviceFormWhereItIsTheLongerOne) {
    const RegisterTag tag("string-5", 4);
    EXPECT_EQ(4 * 8 + 6 * 8, ProtUtilsN::getEndingBit(&tag));
}

}  // namespace
