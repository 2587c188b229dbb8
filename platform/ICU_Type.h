// The data types of tags. The numbers are part of the interface between host and driver.
#pragma once

#include <cstdint>

/// Data type codes 1..27; `none` stands for "no element type" of a scalar. The enumerators carry
/// the type strings' names; where the string ends in "-" (an array) the name ends in `Array`,
/// except `string` ("string-") and `binary` ("binary-"), and C++ keywords gain an underscore.
enum class ICU_Type : std::int32_t {
    none = 0,
    boolean = 1,
    byte = 2,
    short_ = 3,
    int_ = 4,
    unsignedByte = 5,
    unsignedShort = 6,
    unsignedInt = 7,
    float_ = 8,
    double_ = 9,
    string = 10,
    binary = 11,
    time = 12,
    booleanArray = 13,
    byteArray = 14,
    shortArray = 15,
    intArray = 16,
    unsignedByteArray = 17,
    unsignedShortArray = 18,
    unsignedIntArray = 19,
    floatArray = 20,
    doubleArray = 21,
    timeArray = 22,
    uint64 = 23,
    int64 = 24,
    uint64Array = 25,
    int64Array = 26,
    object = 27,
};
