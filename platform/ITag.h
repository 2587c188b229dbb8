// A tag: one named data point of a device, made by a protocol from a tag URI.
#pragma once

#include "platform/ICU_Type.h"

/// Lengths: a boolean or boolean-array tag counts bits, every other tag counts bytes.
/// Forms: the *run-time form* is what an application sees (a bit tag is one byte per bit, 0 or 1;
/// numbers are little-endian); the *device form* is the packed image that a block read delivers.
/// Threads: a tag does not change after its creation; the const operations may run concurrently.
class ITag {
  public:
    virtual ~ITag() = default;

    /// @return a copy that the caller owns, or null when there is no memory for one.
    virtual ITag* Clone() const = 0;
    /// @return the item address of the tag's first item; for bit memories that of its byte.
    virtual unsigned int GetByteOffset() const = 0;
    /// @return the first bit, counted from the start of the item at GetByteOffset().
    virtual int GetBitIndex() const = 0;
    /// @return the tag's URI; lives as long as the tag.
    virtual const char* GetVarName() const = 0;
    virtual ICU_Type GetVarType() const = 0;
    /// @return length of the run-time form in bytes (for bit tags: bits, which are bytes there
    /// too).
    virtual int GetVarLength() const = 0;
    /// @return the element type of an array, `none` for a scalar.
    virtual ICU_Type GetItemType() const = 0;
    /// @return length of the device form in bytes.
    virtual int PackedLen() const = 0;
    /// Converts one value; `src` and `dst` hold PackedLen() bytes in device form and GetVarLength()
    /// bytes in run-time form. `toDevice` tells the direction (true: a write).
    /// @return false when a conversion refuses the value; a read then leaves `dst` untouched.
    virtual bool ConvertVariable(const unsigned char* src, unsigned char* dst,
                                 bool toDevice) const = 0;
    virtual bool IsReadOnly() const = 0;
    virtual bool IsWriteOnly() const = 0;
    /// What ConvertVariable() does unless a tag class overrides it.
    virtual bool Convert(const unsigned char* src, unsigned char* dst, bool toDevice) const = 0;
    /// Applies the conversion called `name` to the run-time form in `buf`, in place.
    virtual bool DoConversion(unsigned char* buf, const char* name, bool toDevice) const = 0;
};
