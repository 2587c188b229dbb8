// What is known of the data types: enough to turn values into text and back.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "platform/ITag.h"

namespace values {

enum class ValueKind : std::uint8_t {
    Boolean,  ///< One byte, 0 or 1.
    Signed,   ///< Two's complement, little-endian.
    Unsigned,
    Real,    ///< IEEE 754, little-endian.
    Text,    ///< Bytes, filled up with zeroes.
    Binary,  ///< Bytes.
    Array,   ///< Items of another type, one behind the other.
    Opaque,  ///< No form that a person could type.
};

struct ValueType {
    ICU_Type type;
    std::string_view name;  ///< As in a tag URI; where it ends in "-" the item count follows.
    ValueKind kind;
    std::uint8_t bytes;  ///< Of one value; for arrays, text and binary: of one item.
    ICU_Type item;       ///< Of an array; `none` otherwise.
};

inline constexpr std::array kValueTypes{
    ValueType{ICU_Type::boolean, "boolean", ValueKind::Boolean, 1, ICU_Type::none},
    ValueType{ICU_Type::byte, "byte", ValueKind::Signed, 1, ICU_Type::none},
    ValueType{ICU_Type::short_, "short", ValueKind::Signed, 2, ICU_Type::none},
    ValueType{ICU_Type::int_, "int", ValueKind::Signed, 4, ICU_Type::none},
    ValueType{ICU_Type::unsignedByte, "unsignedByte", ValueKind::Unsigned, 1, ICU_Type::none},
    ValueType{ICU_Type::unsignedShort, "unsignedShort", ValueKind::Unsigned, 2, ICU_Type::none},
    ValueType{ICU_Type::unsignedInt, "unsignedInt", ValueKind::Unsigned, 4, ICU_Type::none},
    ValueType{ICU_Type::float_, "float", ValueKind::Real, 4, ICU_Type::none},
    ValueType{ICU_Type::double_, "double", ValueKind::Real, 8, ICU_Type::none},
    ValueType{ICU_Type::string, "string-", ValueKind::Text, 1, ICU_Type::none},
    ValueType{ICU_Type::binary, "binary-", ValueKind::Binary, 1, ICU_Type::none},
    ValueType{ICU_Type::time, "time", ValueKind::Opaque, 10, ICU_Type::none},
    ValueType{ICU_Type::booleanArray, "boolean-", ValueKind::Array, 1, ICU_Type::boolean},
    ValueType{ICU_Type::byteArray, "byte-", ValueKind::Array, 1, ICU_Type::byte},
    ValueType{ICU_Type::shortArray, "short-", ValueKind::Array, 2, ICU_Type::short_},
    ValueType{ICU_Type::intArray, "int-", ValueKind::Array, 4, ICU_Type::int_},
    ValueType{ICU_Type::unsignedByteArray, "unsignedByte-", ValueKind::Array, 1,
              ICU_Type::unsignedByte},
    ValueType{ICU_Type::unsignedShortArray, "unsignedShort-", ValueKind::Array, 2,
              ICU_Type::unsignedShort},
    ValueType{ICU_Type::unsignedIntArray, "unsignedInt-", ValueKind::Array, 4,
              ICU_Type::unsignedInt},
    ValueType{ICU_Type::floatArray, "float-", ValueKind::Array, 4, ICU_Type::float_},
    ValueType{ICU_Type::doubleArray, "double-", ValueKind::Array, 8, ICU_Type::double_},
    ValueType{ICU_Type::timeArray, "time-", ValueKind::Opaque, 10, ICU_Type::none},
    ValueType{ICU_Type::uint64, "uint64", ValueKind::Unsigned, 8, ICU_Type::none},
    ValueType{ICU_Type::int64, "int64", ValueKind::Signed, 8, ICU_Type::none},
    ValueType{ICU_Type::uint64Array, "uint64-", ValueKind::Array, 8, ICU_Type::uint64},
    ValueType{ICU_Type::int64Array, "int64-", ValueKind::Array, 8, ICU_Type::int64},
    ValueType{ICU_Type::object, "object", ValueKind::Opaque, 1, ICU_Type::none},
};

constexpr bool rowsMatchCodes() {
    for (std::size_t row = 0; row < kValueTypes.size(); ++row) {
        if (static_cast<std::size_t>(kValueTypes[row].type) != row + 1) return false;
    }
    return true;
}
static_assert(kValueTypes.size() == static_cast<std::size_t>(ICU_Type::object));
static_assert(rowsMatchCodes());

/// Type and length, in bytes of the run-time form, of one tag's value.
struct ValueShape {
    ICU_Type type;
    std::size_t bytes;
};

ValueShape shapeOf(const ITag& tag);

/// @return the type's row. REQUIRES: `type` is one of the 27 codes.
const ValueType& rowOf(ICU_Type type);

/// @return the row of one item: an array's item type, else the type's own.
const ValueType& itemRowOf(ICU_Type type);

/// @return true for numbers and arrays of numbers; booleans, texts and bytes are none.
bool holdsNumbers(ICU_Type type);

/// @return the row of that name, with the "-" of an array; null for a name of no type.
const ValueType* typeNamed(std::string_view name);

/// @return the type as a tag URI writes it, with the item count, e.g. "int-10".
std::string typeName(ValueShape shape);

/// @return the items of an array, text or binary; 1 for everything else.
std::size_t itemCount(ValueShape shape);

}  // namespace values
