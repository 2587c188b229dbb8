#include "framework/DataTypes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "tests/unit/framework/ValueTag.h"

namespace {

using Names = std::vector<std::string>;

// Typed independently of the table under test: text, code, element code, length, flag.
struct KnownRow {
    const char* text;
    int code;
    int element;
    int length;
    std::uint32_t flag;
};
constexpr KnownRow kKnown[] = {
    {"boolean", 1, 0, 1, 0x1},
    {"byte", 2, 0, 1, 0x2},
    {"short", 3, 0, 2, 0x4},
    {"int", 4, 0, 4, 0x8},
    {"unsignedByte", 5, 0, 1, 0x10},
    {"unsignedShort", 6, 0, 2, 0x20},
    {"unsignedInt", 7, 0, 4, 0x40},
    {"float", 8, 0, 4, 0x80},
    {"double", 9, 0, 8, 0x100},
    {"string-", 10, 2, 0, 0x200},
    {"binary-", 11, 5, 0, 0x400},
    {"time", 12, 0, 10, 0x800},
    {"boolean-", 13, 1, 0, 0x1000},
    {"byte-", 14, 2, 0, 0x2000},
    {"short-", 15, 3, 0, 0x4000},
    {"int-", 16, 4, 0, 0x8000},
    {"unsignedByte-", 17, 5, 0, 0x10000},
    {"unsignedShort-", 18, 6, 0, 0x20000},
    {"unsignedInt-", 19, 7, 0, 0x40000},
    {"float-", 20, 8, 0, 0x80000},
    {"double-", 21, 9, 0, 0x100000},
    {"time-", 22, 12, 0, 0x200000},
    {"uint64", 23, 0, 8, 0x400000},
    {"int64", 24, 0, 8, 0x800000},
    {"uint64-", 25, 23, 0, 0x1000000},
    {"int64-", 26, 24, 0, 0x2000000},
    {"object", 27, 0, 0, 0x4000000},
};

constexpr ICU_Type Code(int code) {
    return static_cast<ICU_Type>(code);
}

struct Parsed {
    bool ok = false;
    int type = -1;
    int element = -1;
    int length = -77;
    Names conversions;
    bool operator==(const Parsed&) const = default;
};

void PrintTo(const Parsed& parsed, std::ostream* out) {
    *out << (parsed.ok ? "ok " : "refused ") << parsed.type << ' ' << parsed.element << ' '
         << parsed.length << ' ' << testing::PrintToString(parsed.conversions);
}

Parsed Parse(const std::string& text) {
    Parsed parsed;
    ICU_Type type = Code(parsed.type);
    ICU_Type element = Code(parsed.element);
    parsed.ok = ProtUtilsN::GetICOMType(text, type, element, parsed.length, parsed.conversions);
    parsed.type = static_cast<int>(type);
    parsed.element = static_cast<int>(element);
    return parsed;
}

Parsed Accepted(int type, int element, int length, Names conversions = {}) {
    return {true, type, element, length, std::move(conversions)};
}

Parsed Refused(Names conversions = {}) {
    return {false, -1, -1, -77, std::move(conversions)};
}

TEST(DataTypesTest, TableHasTheTwentySevenRows) {
    ASSERT_EQ(std::size(kKnown), ProtUtilsN::DataTypes.size());
    for (std::size_t i = 0; i < std::size(kKnown); ++i) {
        const ProtUtilsN::DataType& row = ProtUtilsN::DataTypes[i];
        EXPECT_EQ(row.typeString, kKnown[i].text) << i;
        EXPECT_EQ(static_cast<int>(row.type), kKnown[i].code) << i;
        EXPECT_EQ(static_cast<int>(row.elementType), kKnown[i].element) << i;
        EXPECT_EQ(row.fixedLength, kKnown[i].length) << i;
        EXPECT_EQ(row.typeFlag, kKnown[i].flag) << i;
    }
}

TEST(DataTypesTest, GetICOMTypeReadsEveryRow) {
    for (const KnownRow& row : kKnown) {
        const std::string text = row.text;
        const bool array = text.back() == '-';
        const int length = array ? 3 * ProtUtilsN::GetDataLength(Code(row.element)) : row.length;
        EXPECT_EQ(Accepted(row.code, row.element, length), Parse(array ? text + "3" : text))
            << text;
    }
}

TEST(DataTypesTest, GetICOMTypeTakesTextsApart) {
    const std::vector<std::pair<std::string, Parsed>> rows = {
        {"int", Accepted(4, 0, 4)},
        {"int-10", Accepted(16, 4, 40)},
        {"string-20", Accepted(10, 2, 20)},
        {"boolean-16", Accepted(13, 1, 16)},
        {"time-2", Accepted(22, 12, 20)},
        {"uint64-2", Accepted(25, 23, 16)},
        {"object", Accepted(27, 0, 0)},
        {"float(swap2)", Accepted(8, 0, 4, {"swap2"})},
        {"short(bcd, swap2)", Accepted(3, 0, 2, {"bcd", "swap2"})},
        {"int-2(\tswap2 ,,swap4 )", Accepted(16, 4, 8, {"swap2", "", "swap4"})},
        {"short()", Accepted(3, 0, 2, {""})},
        {"short (bcd) and more", Accepted(3, 0, 2, {"bcd"})},
        {" \tunsignedShort\t ", Accepted(6, 0, 2)},
        // the count: blanks and a sign in front, anything behind
        {"int- 10", Accepted(16, 4, 40)},
        {"int-+2", Accepted(16, 4, 8)},
        {"int-2x9", Accepted(16, 4, 8)},
        {"int-010", Accepted(16, 4, 40)},
        {"int-0x10", Accepted(16, 4, 0)},
        {"int-", Accepted(16, 4, 0)},
        {"int-abc", Accepted(16, 4, 0)},
        {"int--2", Accepted(16, 4, -8)},
        // a closing parenthesis in front encloses nothing
        {"int-3)(swap2", Accepted(16, 4, 12, {""})},
    };
    for (const auto& [text, expected] : rows) {
        EXPECT_EQ(expected, Parse(text)) << '"' << text << '"';
    }
}

TEST(DataTypesTest, GetICOMTypeRefusesWhatIsNoType) {
    const std::vector<std::pair<std::string, Parsed>> rows = {
        {"", Refused()},
        {"-", Refused()},
        {"UnsignedShort", Refused()},
        {"integer", Refused()},
        {"int5", Refused()},
        {"string", Refused()},
        {"object-2", Refused()},
        {"int\n", Refused()},
        {"in t", Refused()},
        {"int -3", Refused()},
        {"Float-2", Refused()},
        {")int(", Refused({""})},
        {"(swap2)", Refused({"swap2"})},
        {"wrong(swap2,bcd)", Refused({"swap2", "bcd"})},
    };
    for (const auto& [text, expected] : rows) {
        EXPECT_EQ(expected, Parse(text)) << '"' << text << '"';
    }
}

TEST(DataTypesTest, GetICOMTypeMissesTheClosingParenthesisBeforeItLooksAtTheName) {
    EXPECT_EQ(Parse("float(swap2"), Refused());
    EXPECT_EQ(Parse("int-3(bcd"), Refused());
    EXPECT_EQ(Parse("wrong(swap2"), Refused());
}

TEST(DataTypesTest, GetICOMTypeAppendsToTheConversions) {
    ICU_Type type = ICU_Type::none;
    ICU_Type element = ICU_Type::none;
    int length = 0;
    Names conversions = {"first"};
    EXPECT_TRUE(ProtUtilsN::GetICOMType("int(neg)", type, element, length, conversions));
    EXPECT_EQ((Names{"first", "neg"}), conversions);
}

TEST(DataTypesTest, GetICOMTypeKeepsLengthsToThirtyTwoBits) {
    const std::vector<std::pair<std::string, int>> rows = {
        {"int-2000000000", INT32_MAX},          {"byte-2147483647", INT32_MAX},
        {"byte-99999999999", INT32_MAX},        {"int-4294967297", INT32_MAX},
        {"double-268435455", 2147483640},       {"int--2000000000", INT32_MIN},
        {"time--99999999999999999", INT32_MIN}, {"boolean--7", -7},
    };
    for (const auto& [text, length] : rows) {
        const Parsed parsed = Parse(text);
        EXPECT_TRUE(parsed.ok) << text;
        EXPECT_EQ(length, parsed.length) << text;
    }
}

TEST(DataTypesTest, GetICOMNameAppendsTheElementCountOfArrays) {
    struct Row {
        int type;
        int length;
        const char* name;
    };
    const Row rows[] = {
        {1, 1, "boolean"},      {4, 4, "int"},      {4, 400, "int"},       {16, 40, "int-10"},
        {16, 43, "int-10"},     {16, 0, "int-0"},   {10, 20, "string-20"}, {11, 7, "binary-7"},
        {13, 16, "boolean-16"}, {22, 20, "time-2"}, {26, 80, "int64-10"},  {27, 5, "object5"},
        {27, 0, "object0"},     {0, 4, "??"},       {28, 4, "??"},         {-1, 4, "??"},
    };
    for (const Row& row : rows) {
        EXPECT_EQ(ProtUtilsN::GetICOMName(Code(row.type), row.length), row.name) << row.type;
    }
}

TEST(DataTypesTest, GetICOMNameIsReadBackAsTheSameType) {
    for (const KnownRow& row : kKnown) {
        if (row.code == 27) continue;  // the count behind "object" makes it no type
        const int itemLength = ProtUtilsN::GetDataLength(Code(row.element));
        const int length = row.length != 0 ? row.length : 5 * itemLength;
        const std::string name = ProtUtilsN::GetICOMName(Code(row.code), length);
        EXPECT_EQ(Accepted(row.code, row.element, length), Parse(name)) << name;
    }
}

TEST(DataTypesTest, GetDataLengthCoversScalarsOnly) {
    const int lengths[] = {0, 1, 1, 2, 4, 1, 2, 4, 4, 8, 0, 0, 10, 0, 0,
                           0, 0, 0, 0, 0, 0, 0, 0, 8, 8, 0, 0, 0,  0};
    for (int code = 0; code < static_cast<int>(std::size(lengths)); ++code) {
        EXPECT_EQ(lengths[code], ProtUtilsN::GetDataLength(Code(code))) << code;
    }
    for (const int code : {-1, 1000, INT32_MIN, INT32_MAX}) {
        EXPECT_EQ(0, ProtUtilsN::GetDataLength(Code(code))) << code;
    }
}

TEST(DataTypesTest, GetItemCountDividesTheLength) {
    EXPECT_EQ(ProtUtilsN::GetItemCount(40, Code(4)), 10);
    EXPECT_EQ(ProtUtilsN::GetItemCount(43, Code(4)), 10);
    EXPECT_EQ(ProtUtilsN::GetItemCount(0, Code(4)), 0);
}

TEST(DataTypesTest, GetItemCountIsOneWhereItemsHaveNoLength) {
    for (const int code : {0, 10, 16, 25, 27, 28, -1}) {
        EXPECT_EQ(1, ProtUtilsN::GetItemCount(40, Code(code))) << code;
    }
}

TEST(DataTypesTest, TagQueriesTellItemsOfATag) {
    struct Row {
        const char* text;
        int items;
        int basicType;
        int basicLength;
        bool bits;
    };
    const Row rows[] = {
        {"int", 1, 4, 4, false},      {"int-10", 10, 4, 4, false}, {"string-20", 20, 2, 1, false},
        {"binary-3", 3, 5, 1, false}, {"boolean", 1, 1, 1, true},  {"boolean-16", 16, 1, 1, true},
        {"time-2", 2, 12, 10, false}, {"object", 1, 27, 0, false}, {"int64-0", 0, 24, 8, false},
        {"byte", 1, 2, 1, false},
    };
    for (const Row& row : rows) {
        const ValueTag tag(row.text);
        EXPECT_EQ(row.items, ProtUtilsN::GetItemCount(&tag)) << row.text;
        EXPECT_EQ(row.basicType, static_cast<int>(ProtUtilsN::GetBasicType(&tag))) << row.text;
        EXPECT_EQ(row.basicLength, ProtUtilsN::GetBasicLength(&tag)) << row.text;
        EXPECT_EQ(row.bits, ProtUtilsN::IsBitType(&tag)) << row.text;
    }
}

TEST(DataTypesTest, TagQueriesCountOneItemWhereTheItemTypeHasNoLength) {
    ValueTag tag("int-10");
    tag.setType(Code(16), Code(16), 40);
    EXPECT_EQ(1, ProtUtilsN::GetItemCount(&tag));
}

TEST(DataTypesTest, IsBitTypeHoldsForBooleanAndItsArrayOnly) {
    for (int code = -1; code < 30; ++code) {
        EXPECT_EQ(code == 1 || code == 13, ProtUtilsN::IsBitType(Code(code))) << code;
    }
}

TEST(DataTypesTest, GetTypeFlagIsOneBitPerType) {
    for (const KnownRow& row : kKnown) {
        EXPECT_EQ(ProtUtilsN::GetTypeFlag(Code(row.code)), 1 << (row.code - 1)) << row.text;
    }
    for (const int code : {0, 28, -1, INT32_MIN}) {
        EXPECT_EQ(0, ProtUtilsN::GetTypeFlag(Code(code))) << code;
    }
}

TEST(DataTypesTest, GetVersionIsTwoHundred) {
    EXPECT_EQ(ProtUtilsN::GetVersion(), 200);
}

}  // namespace
