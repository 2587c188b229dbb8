// Values that are accepted, and the way back.
#include "values/Values.h"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <limits>
#include <random>

#include "tests/unit/values/ValueSupport.h"
#include "values/Numbers.h"

namespace {

using values::Bytes;
using values::formatValue;
using values::parseValue;
using values::ValueShape;
using enum ICU_Type;

struct Accepted {
    ValueShape shape;
    std::string_view text;
    Bytes bytes;
    std::string_view printed;  ///< Empty: as `text`.
};

const Accepted kAccepted[] = {
    {{boolean, 1}, "0", {0}, ""},
    {{boolean, 1}, "1", {1}, ""},
    {{boolean, 1}, "false", {0}, "0"},
    {{boolean, 1}, "true", {1}, "1"},
    {{byte, 1}, "-128", {0x80}, ""},
    {{byte, 1}, "127", {0x7F}, ""},
    {{byte, 1}, "-0x80", {0x80}, "-128"},
    {{short_, 2}, "-32768", {0x00, 0x80}, ""},
    {{short_, 2}, "32767", {0xFF, 0x7F}, ""},
    {{short_, 2}, "0x7fff", {0xFF, 0x7F}, "32767"},
    {{short_, 2}, "-1", {0xFF, 0xFF}, ""},
    {{short_, 2}, "-0", {0x00, 0x00}, "0"},
    {{int_, 4}, "-2147483648", {0, 0, 0, 0x80}, ""},
    {{int_, 4}, "2147483647", {0xFF, 0xFF, 0xFF, 0x7F}, ""},
    {{int_, 4}, "+16909060", {4, 3, 2, 1}, "16909060"},
    {{unsignedByte, 1}, "255", {255}, ""},
    {{unsignedByte, 1}, "0XfF", {255}, "255"},
    {{unsignedShort, 2}, "65535", {0xFF, 0xFF}, ""},
    {{unsignedShort, 2}, " \t258 ", {2, 1}, "258"},
    {{unsignedShort, 2}, "010", {10, 0}, "10"},
    {{unsignedShort, 2}, "-0", {0, 0}, "0"},
    {{unsignedInt, 4}, "4294967295", {0xFF, 0xFF, 0xFF, 0xFF}, ""},
    {{unsignedInt, 4}, "0x01020304", {4, 3, 2, 1}, "16909060"},
    {{uint64, 8}, "18446744073709551615", {255, 255, 255, 255, 255, 255, 255, 255}, ""},
    {{uint64, 8}, "0x0102030405060708", {8, 7, 6, 5, 4, 3, 2, 1}, "72623859790382856"},
    {{int64, 8}, "-9223372036854775808", {0, 0, 0, 0, 0, 0, 0, 0x80}, ""},
    {{int64, 8}, "9223372036854775807", {255, 255, 255, 255, 255, 255, 255, 0x7F}, ""},
    {{float_, 4}, "1.5", {0, 0, 0xC0, 0x3F}, ""},
    {{float_, 4}, "-0", {0, 0, 0, 0x80}, ""},
    {{float_, 4}, "0.1", {0xCD, 0xCC, 0xCC, 0x3D}, ""},
    {{float_, 4}, "+2", {0, 0, 0, 0x40}, "2"},
    {{float_, 4}, "16777216", {0, 0, 0x80, 0x4B}, "16777216"},
    {{float_, 4}, "3.4028235e+38", {0xFF, 0xFF, 0x7F, 0x7F}, ""},
    {{float_, 4}, "1e-45", {1, 0, 0, 0}, ""},
    {{float_, 4}, "0e99", {0, 0, 0, 0}, "0"},
    {{float_, 4}, "inf", {0, 0, 0x80, 0x7F}, ""},
    {{float_, 4}, "-inf", {0, 0, 0x80, 0xFF}, ""},
    {{float_, 4}, "nan", {0, 0, 0xC0, 0x7F}, ""},
    {{float_, 4}, "-nan", {0, 0, 0xC0, 0xFF}, ""},
    {{float_, 4}, "nan(0x7f800001)", {1, 0, 0x80, 0x7F}, ""},
    {{float_, 4}, "0x10", {0, 0, 0x80, 0x41}, "16"},
    {{float_, 4}, "0x1.8p3", {0, 0, 0x40, 0x41}, "12"},
    {{float_, 4}, "-0x0p0", {0, 0, 0, 0x80}, "-0"},
    {{double_, 8}, "0.1", {0x9A, 0x99, 0x99, 0x99, 0x99, 0x99, 0xB9, 0x3F}, ""},
    {{double_, 8}, "5e-324", {1, 0, 0, 0, 0, 0, 0, 0}, ""},
    {{double_, 8}, "1.7976931348623157e+308", {255, 255, 255, 255, 255, 255, 0xEF, 0x7F}, ""},
    {{double_, 8}, "nan(0x7ff0000000000001)", {1, 0, 0, 0, 0, 0, 0xF0, 0x7F}, ""},
    {{string, 4}, "\"ab\"", {'a', 'b', 0, 0}, ""},
    {{string, 4}, "ab", {'a', 'b', 0, 0}, "\"ab\""},
    {{string, 4}, "", {0, 0, 0, 0}, "\"\""},
    {{string, 4}, "\"\"", {0, 0, 0, 0}, ""},
    {{string, 4}, "abcd", {'a', 'b', 'c', 'd'}, "\"abcd\""},
    {{string, 4}, " a=b", {' ', 'a', '=', 'b'}, "\" a=b\""},
    {{string, 4}, "\"\\0a\"", {0, 'a', 0, 0}, ""},
    {{string, 0}, "\"\"", {}, ""},
    {{binary, 3}, "0x0102ff", {1, 2, 255}, ""},
    {{binary, 3}, "0102FF", {1, 2, 255}, "0x0102ff"},
    {{booleanArray, 3}, "1,0,1", {1, 0, 1}, ""},
    {{booleanArray, 3}, "true, 0 ,false", {1, 0, 0}, "1,0,0"},
    {{byteArray, 2}, "-1,1", {255, 1}, ""},
    {{shortArray, 4}, "-2,258", {0xFE, 0xFF, 2, 1}, ""},
    {{intArray, 4}, "7", {7, 0, 0, 0}, ""},
    {{intArray, 0}, "", {}, ""},
    {{unsignedByteArray, 2}, "0x10,255", {16, 255}, "16,255"},
    {{unsignedShortArray, 4}, "1,2", {1, 0, 2, 0}, ""},
    {{unsignedIntArray, 8}, "1,4294967295", {1, 0, 0, 0, 255, 255, 255, 255}, ""},
    {{floatArray, 8}, "1.5,-2", {0, 0, 0xC0, 0x3F, 0, 0, 0, 0xC0}, ""},
    {{doubleArray, 8}, "2", {0, 0, 0, 0, 0, 0, 0, 0x40}, ""},
    {{uint64Array, 8}, "1", {1, 0, 0, 0, 0, 0, 0, 0}, ""},
    {{int64Array, 8}, "-1", {255, 255, 255, 255, 255, 255, 255, 255}, ""},
};

TEST(ValuesTest, AreReadByTheTagsType) {
    for (const Accepted& row : kAccepted) {
        SCOPED_TRACE(values::typeName(row.shape) + ": " + std::string(row.text));
        EXPECT_EQ(row.bytes, parseValue(row.shape, row.text));
    }
}

TEST(ValuesTest, ArePrintedInOneForm) {
    for (const Accepted& row : kAccepted) {
        const std::string_view expected = row.printed.empty() ? row.text : row.printed;
        EXPECT_EQ(expected, formatValue(row.shape, row.bytes)) << values::typeName(row.shape);
    }
}

/// Every type that has a text form, with room for a few items.
std::vector<ValueShape> writableShapes() {
    std::vector<ValueShape> shapes;
    for (const values::ValueType& row : values::kValueTypes) {
        if (row.kind == values::ValueKind::Opaque) continue;
        shapes.push_back({row.type, row.name.ends_with('-') ? row.bytes * std::size_t{5}
                                                            : std::size_t{row.bytes}});
    }
    return shapes;
}

bool countsBits(ICU_Type type) {
    return type == boolean || type == booleanArray;
}

TEST(ValuesTest, ReadBackExactlyWhateverTheirBits) {
    std::mt19937 random(20240501);
    ASSERT_EQ(24U, writableShapes().size());
    for (const ValueShape shape : writableShapes()) {
        for (int round = 0; round < 2000; ++round) {
            Bytes bytes(shape.bytes);
            for (auto& b : bytes) {
                b = static_cast<std::uint8_t>(random() & (countsBits(shape.type) ? 1 : 255));
            }
            const std::string text = formatValue(shape, bytes);
            ASSERT_EQ(bytes, parseValue(shape, text)) << values::typeName(shape) << ": " << text;
        }
    }
}

TEST(ValuesTest, EveryKindOfFloatReadsBackExactly) {
    // Sign and exponent whole, the mantissa at its ends and in between.
    for (std::uint32_t top = 0; top < 512; ++top) {
        for (const std::uint32_t low : {0U, 1U, 0x2AAAAAU, 0x400000U, 0x7FFFFFU}) {
            Bytes bytes;
            values::appendLittleEndian(bytes, top << 23 | low, 4);
            const std::string text = formatValue({float_, 4}, bytes);
            ASSERT_EQ(bytes, parseValue({float_, 4}, text)) << text;
        }
    }
}

TEST(ValuesTest, WholeNumberRangesEndWhereTheTypesEnd) {
    const auto range = [](ICU_Type type) { return values::rangeText(values::rowOf(type)); };
    EXPECT_EQ("-128..127", range(byte));
    EXPECT_EQ("-32768..32767", range(short_));
    EXPECT_EQ("-2147483648..2147483647", range(int_));
    EXPECT_EQ("-9223372036854775808..9223372036854775807", range(int64));
    EXPECT_EQ("0..255", range(unsignedByte));
    EXPECT_EQ("0..65535", range(unsignedShort));
    EXPECT_EQ("0..4294967295", range(unsignedInt));
    EXPECT_EQ("0..18446744073709551615", range(uint64));
}

TEST(ValuesTest, TypesWithoutATextFormAreShownAsBytes) {
    EXPECT_EQ("0x0102030405060708090a",
              formatValue({time, 10}, Bytes{1, 2, 3, 4, 5, 6, 7, 8, 9, 10}));
    EXPECT_EQ("0x", formatValue({object, 0}, Bytes{}));
}

TEST(ValuesTest, NumbersAndTheirArraysAreNumbers) {
    for (const ICU_Type type : {ICU_Type::byte, ICU_Type::uint64, ICU_Type::float_,
                                ICU_Type::doubleArray, ICU_Type::unsignedShortArray})
        EXPECT_TRUE(values::holdsNumbers(type)) << static_cast<int>(type);
    for (const ICU_Type type : {ICU_Type::boolean, ICU_Type::booleanArray, ICU_Type::string,
                                ICU_Type::binary, ICU_Type::time, ICU_Type::object})
        EXPECT_FALSE(values::holdsNumbers(type)) << static_cast<int>(type);
}

TEST(ValuesTest, TypesAreNamedAsUrisNameThem) {
    EXPECT_EQ("int", values::typeName({int_, 4}));
    EXPECT_EQ("int-10", values::typeName({intArray, 40}));
    EXPECT_EQ("string-20", values::typeName({string, 20}));
    EXPECT_EQ("boolean-16", values::typeName({booleanArray, 16}));
    EXPECT_EQ("int64-2", values::typeName({int64Array, 16}));
}

}  // namespace
