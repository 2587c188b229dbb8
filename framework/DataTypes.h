// The closed set of data types: their texts, sizes and mask bits. Pure, callable from any thread.
#pragma once

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ITag.h"

namespace ProtUtilsN {

/// One data type. A type mask ("icomTypes") is an OR of type flags.
struct DataType {
    std::string_view typeString;  ///< As written in a tag URI; an array's ends in "-".
    ICU_Type type;
    ICU_Type elementType;      ///< `none` for a scalar.
    std::int32_t fixedLength;  ///< Bytes; 0 when the length follows from the element count.
    std::uint32_t typeFlag;    ///< Exactly one bit.
};

/// The 27 data types, row i for code i + 1.
extern const std::array<DataType, 27> DataTypes;

/// Parses a data type with its optional conversions, e.g. "int-10" or "short(bcd, swap2)".
/// @param length       Receives bytes; for boolean types bits, which are the same number.
/// @param conversions  The names in the parentheses are appended, also when a later step fails.
/// @return false, with the three scalar outputs untouched, when the text is no data type.
bool GetICOMType(const std::string& text, ICU_Type& type, ICU_Type& elementType, int& length,
                 std::vector<std::string>& conversions);

/// @return the type string, with the element count where the type has no fixed length; "??" when
/// there is no such type.
std::string GetICOMName(ICU_Type type, int length);

/// @return bytes of one datum: 0 for arrays and for what is no type.
int GetDataLength(ICU_Type type);

/// @return how many items of `type` `length` bytes hold; 1 where an item has no length.
int GetItemCount(int length, ICU_Type type);
int GetItemCount(const ITag* tag);

/// @return the type of one item of the tag, and its length in bytes.
ICU_Type GetBasicType(const ITag* tag);
int GetBasicLength(const ITag* tag);

/// True for boolean and boolean arrays.
bool IsBitType(ICU_Type type);
bool IsBitType(const ITag* tag);

/// @return the type's bit in a type mask, 0 for what is no type.
int GetTypeFlag(ICU_Type type);

/// @return 200, the version of this utility set.
int GetVersion();

}  // namespace ProtUtilsN
