#include "framework/TagBase.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "tests/unit/framework/ValueTag.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr bool kRead = false;
constexpr bool kWrite = true;
const Bytes kUntouched(8, 0xEE);

Bytes Counted(std::size_t size) {
    Bytes bytes(size);
    for (std::size_t i = 0; i < size; ++i)
        bytes[i] = static_cast<unsigned char>(i + 1);
    return bytes;
}

// The result of a conversion that must succeed.
Bytes Convert(const ITag& tag, const Bytes& src, bool toDevice, Bytes dst) {
    EXPECT_TRUE(tag.Convert(src.data(), dst.data(), toDevice)) << tag.GetVarName();
    return dst;
}

TEST(TagBaseTest, IsReadAndWritable) {
    const ValueTag tag("int");
    EXPECT_FALSE(tag.IsReadOnly());
    EXPECT_FALSE(tag.IsWriteOnly());
    EXPECT_STREQ("", tag.getError());
}

TEST(TagBaseTest, KeepsAnErrorTextThoughConstant) {
    const ValueTag tag("int");
    tag.SetError("first");
    tag.SetError("second");
    EXPECT_STREQ("second", tag.getError());
}

TEST(TagBaseTest, PackedLenIsTheLengthExceptForBits) {
    struct Row {
        const char* type;
        int bitIndex;
        int packed;
    };
    const Row rows[] = {
        {"int", 0, 4},       {"int-10", 5, 40},   {"string-5", 0, 5},  {"boolean", 0, 1},
        {"boolean", 7, 1},   {"boolean-8", 0, 1}, {"boolean-8", 1, 2}, {"boolean-16", 4, 3},
        {"boolean-2", 7, 2}, {"boolean-0", 3, 1}, {"object", 0, 0},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(row.packed, ValueTag(row.type, 0, row.bitIndex).PackedLen()) << row.type;
    }
}

TEST(TagBaseTest, ConvertCopiesBytesWithoutConversions) {
    const ValueTag tag("int");
    EXPECT_EQ((Bytes{1, 2, 3, 4, 0xEE}), Convert(tag, {1, 2, 3, 4}, kRead, Bytes(5, 0xEE)));
    EXPECT_EQ((Bytes{1, 2, 3, 4, 0xEE}), Convert(tag, {1, 2, 3, 4}, kWrite, Bytes(5, 0xEE)));
}

TEST(TagBaseTest, ConvertUnpacksBitsOnARead) {
    const ValueTag tag("boolean-5", 0, 6);
    EXPECT_EQ((Bytes{1, 0, 1, 0, 1, 0xEE}), Convert(tag, {0x40, 0x05}, kRead, Bytes(6, 0xEE)));
}

TEST(TagBaseTest, ConvertLeavesOtherBitsOnAWrite) {
    const ValueTag tag("boolean-3", 0, 6);
    EXPECT_EQ((Bytes{0x40, 0x01}), Convert(tag, {1, 0, 9}, kWrite, {0x00, 0x00}));
    EXPECT_EQ((Bytes{0x7F, 0xFF}), Convert(tag, {1, 0, 9}, kWrite, {0xFF, 0xFF}));
}

TEST(TagBaseTest, ConvertInvertsBits) {
    const ValueTag tag("boolean-3(inv)");
    EXPECT_EQ((Bytes{0, 1, 0}), Convert(tag, {0x05}, kRead, Bytes(3, 0xEE)));
    EXPECT_EQ((Bytes{0xFA}), Convert(tag, {1, 0, 1}, kWrite, {0xF8}));
}

// Records the order of the conversions.
class RecordingTag : public ValueTag {
  public:
    using ValueTag::ValueTag;
    bool DoConversion(unsigned char* buf, const char* name, bool toDevice) const override {
        calls_ += std::string(toDevice ? ">" : "<") + name;
        return ValueTag::DoConversion(buf, name, toDevice);
    }
    const std::string& calls() const { return calls_; }

  private:
    mutable std::string calls_;
};

TEST(TagBaseTest, ConvertGoesThroughTheListBackwardsOnARead) {
    const RecordingTag tag("int(swap2,swap4)");
    EXPECT_EQ((Bytes{3, 4, 1, 2}), Convert(tag, {1, 2, 3, 4}, kRead, Bytes(4)));
    EXPECT_EQ("<swap4<swap2", tag.calls());
}

TEST(TagBaseTest, ConvertGoesThroughTheListForwardsOnAWrite) {
    const RecordingTag tag("short(bcd,swap2)");
    EXPECT_EQ((Bytes{0x12, 0x34}), Convert(tag, {0xD2, 0x04}, kWrite, Bytes(2)));
    EXPECT_EQ(">bcd>swap2", tag.calls());
}

TEST(TagBaseTest, ConvertReadsBackWhatItWrote) {
    const ValueTag tag("unsignedShort-2(bcd,swapnibble,swap4)");
    const Bytes value = {0xD2, 0x04, 0x2E, 0x16};
    const Bytes device = Convert(tag, value, kWrite, Bytes(4));
    EXPECT_EQ((Bytes{0x65, 0x87, 0x21, 0x43}), device);
    EXPECT_EQ(value, Convert(tag, device, kRead, Bytes(4)));
}

TEST(TagBaseTest, ConvertNamesTheConversionThatFailsAndLeavesTheDestination) {
    struct Row {
        const char* type;
        Bytes src;
        bool toDevice;
        const char* error;
    };
    const Row rows[] = {
        {"string-3(swap2)", {1, 2, 3}, kRead, "Conversion error at: swap2"},
        {"string-3(swap2)", {1, 2, 3}, kWrite, "Conversion error at: swap2"},
        {"short(bcd)", {0x10, 0x27}, kWrite, "Conversion error at: bcd"},  // 10000
        {"short(bcd)", {0xFF, 0xFF}, kWrite, "Conversion error at: bcd"},  // -1
        {"short(bcd)", {0x3A, 0x12}, kRead, "Conversion error at: bcd"},
        {"unsignedShort(neg)", {1, 0}, kRead, "Conversion error at: neg"},
        {"short(inv)", {1, 0}, kRead, "Conversion error at: inv"},
        {"int(swap3)", {1, 2, 3, 4}, kRead, "Conversion error at: swap3"},
        {"int()", {1, 2, 3, 4}, kRead, "Conversion error at: "},
        {"int64(bcd)", Bytes(8, 0), kWrite, "Conversion error at: bcd"},
        {"boolean-3(swap2)", {0x05, 0, 0}, kWrite, "Conversion error at: swap2"},
        {"boolean-3(swap2)", {0x05}, kRead, "Conversion error at: swap2"},
        // the first one on the way stops the chain
        {"short(swap3,inv)", {1, 0}, kWrite, "Conversion error at: swap3"},
        {"short(swap3,inv)", {1, 0}, kRead, "Conversion error at: inv"},
        {"short(swap2,swap3)", {1, 0}, kWrite, "Conversion error at: swap3"},
    };
    for (const Row& row : rows) {
        const ValueTag tag(row.type);
        Bytes dst = kUntouched;
        EXPECT_FALSE(tag.Convert(row.src.data(), dst.data(), row.toDevice)) << row.type;
        EXPECT_STREQ(row.error, tag.getError()) << row.type;
        EXPECT_EQ(kUntouched, dst) << row.type;
    }
}

TEST(TagBaseTest, ConvertLeavesTheErrorTextOfAnEarlierFailure) {
    const ValueTag tag("short(bcd)");
    Bytes dst(2);
    EXPECT_FALSE(tag.Convert(Bytes{0x3A, 0x12}.data(), dst.data(), kRead));
    EXPECT_TRUE(tag.Convert(Bytes{0x34, 0x12}.data(), dst.data(), kRead));
    EXPECT_STREQ("Conversion error at: bcd", tag.getError());
}

TEST(TagBaseTest, ConvertNegatesTheFrontPartOfAnArray) {
    const ValueTag tag("short-4(neg)");
    EXPECT_EQ((Bytes{0xFF, 0xFF, 0xFF, 0xFF, 1, 0, 1, 0}),
              Convert(tag, {1, 0, 1, 0, 1, 0, 1, 0}, kRead, Bytes(8)));
    EXPECT_EQ((Bytes{0xFF, 0xFE, 0xFD}),
              Convert(ValueTag("string-3(neg)"), {1, 2, 3}, kRead, Bytes(3)));
}

TEST(TagBaseTest, ConvertTakesTheItemsOfBinaryForUnsignedBytes) {
    EXPECT_EQ((Bytes{0xF0, 0x0F}),
              Convert(ValueTag("binary-2(inv)"), {0x0F, 0xF0}, kRead, Bytes(2)));
}

// The device form may cover more than the value, as with odd texts in 16-bit registers.
class PaddedTag : public ValueTag {
  public:
    PaddedTag(const char* dataType, int packedLen) : ValueTag(dataType), packedLen_(packedLen) {}
    int PackedLen() const override { return packedLen_; }

  private:
    int packedLen_;
};

TEST(TagBaseTest, ConvertFillsALongerDeviceFormWithZeroes) {
    const PaddedTag tag("string-3", 4);
    EXPECT_EQ((Bytes{'a', 'b', 'c', 0, 0xEE}),
              Convert(tag, {'a', 'b', 'c'}, kWrite, Bytes(5, 0xEE)));
    EXPECT_EQ((Bytes{'a', 'b', 'c', 0xEE}),
              Convert(tag, {'a', 'b', 'c', 'd'}, kRead, Bytes(4, 0xEE)));
}

TEST(TagBaseTest, ConvertFillsALongerValueWithZeroes) {
    const PaddedTag tag("string-4", 2);
    EXPECT_EQ((Bytes{'a', 'b', 0, 0, 0xEE}), Convert(tag, {'a', 'b'}, kRead, Bytes(5, 0xEE)));
    EXPECT_EQ((Bytes{'a', 'b', 0xEE}), Convert(tag, {'a', 'b', 'c', 'd'}, kWrite, Bytes(3, 0xEE)));
}

// On both sides of the size up to which the work is done without the heap.
TEST(TagBaseTest, ConvertCarriesValuesOfAnySize) {
    for (const int size : {1, 255, 256, 257, 258, 2000}) {
        const ValueTag tag("byte-" + std::to_string(size) + "(swapnibble)");
        const Bytes value = Counted(static_cast<std::size_t>(size));
        const Bytes device = Convert(tag, value, kWrite, Bytes(value.size()));
        EXPECT_NE(device, value) << size;
        EXPECT_EQ(value, Convert(tag, device, kRead, Bytes(value.size()))) << size;
    }
}

TEST(TagBaseTest, ConvertCarriesMoreBitsThanTheLocalBuffer) {
    const ValueTag tag("boolean-2000", 0, 5);
    Bytes value(2000);
    for (std::size_t i = 0; i < value.size(); ++i)
        value[i] = i % 3 == 0;
    const Bytes device = Convert(tag, value, kWrite, Bytes(251, 0));
    EXPECT_EQ(value, Convert(tag, device, kRead, Bytes(2000, 0xEE)));
}

TEST(TagBaseTest, ConvertDoesNothingWithoutALength) {
    for (const char* type : {"object", "int-0", "int--3", "boolean-0", "boolean--9", "wrong"}) {
        const ValueTag tag(type);
        EXPECT_EQ(Bytes(2, 0x11), Convert(tag, kUntouched, kRead, Bytes(2, 0x11))) << type;
        EXPECT_EQ(Bytes(2, 0x11), Convert(tag, kUntouched, kWrite, Bytes(2, 0x11))) << type;
    }
}

class ScaledTag : public ValueTag {
  public:
    using ValueTag::ValueTag;
    bool Convert(const unsigned char* /*src*/, unsigned char* dst, bool toDevice) const override {
        dst[0] = toDevice ? 'w' : 'r';
        return toDevice;
    }
};

TEST(TagBaseTest, ConvertVariableIsConvertUnlessATagOverridesIt) {
    const ScaledTag tag("byte");
    unsigned char dst = 0;
    EXPECT_TRUE(tag.ConvertVariable(nullptr, &dst, kWrite));
    EXPECT_EQ('w', dst);
    EXPECT_FALSE(tag.ConvertVariable(nullptr, &dst, kRead));
    EXPECT_EQ('r', dst);
}

TEST(TagBaseTest, CloneHasConversionsOfItsOwn) {
    const std::unique_ptr<ITag> copy(ValueTag("short(swap2)").Clone());
    EXPECT_EQ((Bytes{2, 1}), Convert(*copy, {1, 2}, kRead, Bytes(2)));
}

}  // namespace
