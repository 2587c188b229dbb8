// The framework's base of every tag: it converts values between device form and run-time form.
#pragma once

#include <string>
#include <vector>

#include "platform/ITag.h"

/// The earlier operations of ITag (offsets, type, lengths) are left to the derived class.
class TagBase : public ITag {
  public:
    int PackedLen() const override;
    bool ConvertVariable(const unsigned char* src, unsigned char* dst,
                         bool toDevice) const override;
    bool IsReadOnly() const override { return false; }
    bool IsWriteOnly() const override { return false; }
    bool Convert(const unsigned char* src, unsigned char* dst, bool toDevice) const override;
    bool DoConversion(unsigned char* buf, const char* name, bool toDevice) const override;

    /// The tag's own error text; it may be set on a constant tag.
    void SetError(const char* text) const { error_ = text; }
    const char* GetError() const { return error_.c_str(); }

    /// The conversion names in the order of the URI.
    const std::vector<std::string>& conversions() const { return conversions_; }

  protected:
    std::vector<std::string> conversions_;

  private:
    bool toDeviceForm(const unsigned char* src, unsigned char* dst, unsigned char* work) const;
    bool toRunTimeForm(const unsigned char* src, unsigned char* dst, unsigned char* work) const;
    bool applyOne(unsigned char* work, const std::string& name, bool toDevice) const;

    mutable std::string error_;
};
