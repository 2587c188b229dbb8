// The named value conversions of tags ("swap2", "bcd" ...). Pure, callable from any thread.
#pragma once

#include "platform/ICU_Type.h"

namespace ProtUtilsN {

/// The value that a conversion works on, in run-time form.
struct ConversionShape {
    int length;      ///< Bytes of the whole value.
    int itemLength;  ///< Bytes of one item.
    int itemCount;
    ICU_Type itemType;
};

/// Applies the conversion called `name` to `buf` in place.
/// @param toDevice  True on the way to the device; only "bcd" depends on it.
/// @return false, with `buf` in an unspecified state, when the conversion does not exist or refuses
/// the value.
bool applyConversion(unsigned char* buf, const char* name, const ConversionShape& shape,
                     bool toDevice);

}  // namespace ProtUtilsN
