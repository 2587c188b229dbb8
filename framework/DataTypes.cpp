// The table of the data types and what is read from it.
#include "framework/DataTypes.h"

#include <algorithm>
#include <cstddef>
#include <limits>

#include "framework/TextUtils.h"

namespace ProtUtilsN {

constexpr std::array<DataType, 27> DataTypes = {{
    {"boolean", ICU_Type::boolean, ICU_Type::none, 1, 0x1},
    {"byte", ICU_Type::byte, ICU_Type::none, 1, 0x2},
    {"short", ICU_Type::short_, ICU_Type::none, 2, 0x4},
    {"int", ICU_Type::int_, ICU_Type::none, 4, 0x8},
    {"unsignedByte", ICU_Type::unsignedByte, ICU_Type::none, 1, 0x10},
    {"unsignedShort", ICU_Type::unsignedShort, ICU_Type::none, 2, 0x20},
    {"unsignedInt", ICU_Type::unsignedInt, ICU_Type::none, 4, 0x40},
    {"float", ICU_Type::float_, ICU_Type::none, 4, 0x80},
    {"double", ICU_Type::double_, ICU_Type::none, 8, 0x100},
    {"string-", ICU_Type::string, ICU_Type::byte, 0, 0x200},
    {"binary-", ICU_Type::binary, ICU_Type::unsignedByte, 0, 0x400},
    {"time", ICU_Type::time, ICU_Type::none, 10, 0x800},
    {"boolean-", ICU_Type::booleanArray, ICU_Type::boolean, 0, 0x1000},
    {"byte-", ICU_Type::byteArray, ICU_Type::byte, 0, 0x2000},
    {"short-", ICU_Type::shortArray, ICU_Type::short_, 0, 0x4000},
    {"int-", ICU_Type::intArray, ICU_Type::int_, 0, 0x8000},
    {"unsignedByte-", ICU_Type::unsignedByteArray, ICU_Type::unsignedByte, 0, 0x10000},
    {"unsignedShort-", ICU_Type::unsignedShortArray, ICU_Type::unsignedShort, 0, 0x20000},
    {"unsignedInt-", ICU_Type::unsignedIntArray, ICU_Type::unsignedInt, 0, 0x40000},
    {"float-", ICU_Type::floatArray, ICU_Type::float_, 0, 0x80000},
    {"double-", ICU_Type::doubleArray, ICU_Type::double_, 0, 0x100000},
    {"time-", ICU_Type::timeArray, ICU_Type::time, 0, 0x200000},
    {"uint64", ICU_Type::uint64, ICU_Type::none, 8, 0x400000},
    {"int64", ICU_Type::int64, ICU_Type::none, 8, 0x800000},
    {"uint64-", ICU_Type::uint64Array, ICU_Type::uint64, 0, 0x1000000},
    {"int64-", ICU_Type::int64Array, ICU_Type::int64, 0, 0x2000000},
    {"object", ICU_Type::object, ICU_Type::none, 0, 0x4000000},
}};

namespace {

// Bytes of one datum, by type code. It ends before the 64-bit arrays and the object: what lies
// behind it has no length.
constexpr std::array kDataLengths = {
    0,                              // none
    1, 1, 2,  4, 1, 2, 4, 4, 8,     // boolean to double
    0, 0, 10,                       // string, binary, time
    0, 0, 0,  0, 0, 0, 0, 0, 0, 0,  // the arrays from boolean to time
    8, 8,                           // uint64, int64
};
static_assert(kDataLengths.size() == static_cast<std::size_t>(ICU_Type::int64) + 1);

constexpr int dataLength(ICU_Type type) {
    const auto code = static_cast<std::int32_t>(type);
    if (code < 0 || static_cast<std::size_t>(code) >= kDataLengths.size()) return 0;
    return kDataLengths[static_cast<std::size_t>(code)];
}

constexpr bool rowsMatchCodes() {
    for (std::size_t i = 0; i < DataTypes.size(); ++i) {
        const auto code = static_cast<std::int32_t>(DataTypes[i].type);
        if (code != static_cast<std::int32_t>(i) + 1) return false;
        if (DataTypes[i].typeFlag != std::uint32_t{1} << i) return false;
    }
    return true;
}
static_assert(rowsMatchCodes());

// The dash, the element type and the missing fixed length go together; only the object has none of
// them, and no length either.
constexpr bool arraysHaveElements() {
    for (const DataType& row : DataTypes) {
        if (row.typeString.empty()) return false;
        const bool array = row.typeString.back() == '-';
        if (array != (row.elementType != ICU_Type::none)) return false;
        if (array && dataLength(row.elementType) == 0) return false;
        const bool sized = !array && row.type != ICU_Type::object;
        if (sized != (row.fixedLength > 0)) return false;
    }
    return true;
}
static_assert(arraysHaveElements());

constexpr bool bothTablesAgree() {
    for (const DataType& row : DataTypes) {
        if (dataLength(row.type) != row.fixedLength) return false;
    }
    return true;
}
static_assert(bothTablesAgree());

const DataType* findRow(ICU_Type type) {
    const auto* row = std::find_if(DataTypes.begin(), DataTypes.end(),
                                   [type](const DataType& each) { return each.type == type; });
    return row == DataTypes.end() ? nullptr : row;
}

const DataType* findRow(std::string_view name) {
    const auto* row =
        std::find_if(DataTypes.begin(), DataTypes.end(),
                     [name](const DataType& each) { return each.typeString == name; });
    return row == DataTypes.end() ? nullptr : row;
}

// Takes the list in parentheses off the text and appends its names.
bool splitConversions(const std::string& text, std::string& front,
                      std::vector<std::string>& conversions) {
    const std::size_t open = text.find('(');
    front = GetTrim(text.substr(0, open));
    if (open == std::string::npos) return true;

    const std::size_t close = text.find(')');
    if (close == std::string::npos) return false;
    // A ")" in front of the "(" encloses nothing.
    const std::size_t size = close > open ? close - open - 1 : 0;
    ParseSubstrings(text.substr(open + 1, size), conversions, ',');
    return true;
}

int arrayLength(const DataType& row, std::int32_t count) {
    using Limits = std::numeric_limits<std::int32_t>;
    const std::int64_t bytes = std::int64_t{GetDataLength(row.elementType)} * count;
    return static_cast<int>(std::clamp<std::int64_t>(bytes, Limits::min(), Limits::max()));
}

}  // namespace

bool GetICOMType(const std::string& text, ICU_Type& type, ICU_Type& elementType, int& length,
                 std::vector<std::string>& conversions) {
    std::string name;
    if (!splitConversions(text, name, conversions)) return false;

    std::int32_t count = 1;
    const std::size_t dash = name.find('-');
    if (dash != std::string::npos) {
        count = parseDecimal(name.c_str() + dash + 1);
        name.erase(dash + 1);
    }

    const DataType* row = findRow(name);
    if (row == nullptr) return false;
    type = row->type;
    elementType = row->elementType;
    length = row->fixedLength != 0 ? row->fixedLength : arrayLength(*row, count);
    return true;
}

std::string GetICOMName(ICU_Type type, int length) {
    const DataType* row = findRow(type);
    if (row == nullptr) return "??";

    std::string name(row->typeString);
    if (row->fixedLength != 0) return name;
    const int elementLength = GetDataLength(row->elementType);
    const int count = elementLength == 0 ? length : length / elementLength;
    std::array<char, 16> digits{};
    return name + itoa(std::max(count, 0), digits.data(), 10);
}

int GetDataLength(ICU_Type type) {
    return dataLength(type);
}

int GetItemCount(int length, ICU_Type type) {
    const int itemLength = GetDataLength(type);
    return itemLength == 0 ? 1 : length / itemLength;
}

int GetItemCount(const ITag* tag) {
    return GetItemCount(tag->GetVarLength(), tag->GetItemType());
}

ICU_Type GetBasicType(const ITag* tag) {
    const ICU_Type itemType = tag->GetItemType();
    return itemType != ICU_Type::none ? itemType : tag->GetVarType();
}

int GetBasicLength(const ITag* tag) {
    return GetDataLength(GetBasicType(tag));
}

bool IsBitType(ICU_Type type) {
    return type == ICU_Type::boolean || type == ICU_Type::booleanArray;
}

bool IsBitType(const ITag* tag) {
    return IsBitType(tag->GetVarType());
}

int GetTypeFlag(ICU_Type type) {
    const DataType* row = findRow(type);
    return row == nullptr ? 0 : static_cast<int>(row->typeFlag);
}

int GetVersion() {
    return 200;
}

}  // namespace ProtUtilsN
