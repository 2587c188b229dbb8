// The framework's base of every tag: it converts values between device form and run-time form.
#pragma once

#include <string>
#include <vector>

#include "framework/KeptText.h"
#include "platform/ITag.h"

/// The earlier operations of ITag (offsets, type, lengths) are left to the derived class.
/// A conversion throws nothing; one that lacks memory fails with the error text "Out of memory".
class TagBase : public ITag {
  public:
    int PackedLen() const override;
    bool ConvertVariable(const unsigned char* src, unsigned char* dst,
                         bool toDevice) const override;
    bool IsReadOnly() const override { return false; }
    bool IsWriteOnly() const override { return false; }
    bool Convert(const unsigned char* src, unsigned char* dst, bool toDevice) const override;
    bool DoConversion(unsigned char* buf, const char* name, bool toDevice) const override;

    /// The tag's own error text; it may be set on a constant tag, by several threads at once.
    /// "Out of memory" takes the place of a new text that finds none. Never throws.
    void SetError(const char* text) const;
    /// @return the last text; readable and unchanged as long as the tag lives.
    const char* getError() const { return error_.get(); }
    /// Whether the last error was a lack of memory.
    bool wasShortOfMemory() const;

    /// The conversion names in the order of the URI.
    const std::vector<std::string>& conversions() const { return conversions_; }

  protected:
    /// SetError() for a text that lives as long as the tag; takes no memory.
    void showError(const char* lasting) const { error_.show(lasting); }
    /// REQUIRES: the tag is being made, nobody converts with it yet. Throws std::bad_alloc.
    void setConversions(std::vector<std::string> names);

  private:
    bool toDeviceForm(const unsigned char* src, unsigned char* dst, unsigned char* work) const;
    bool toRunTimeForm(const unsigned char* src, unsigned char* dst, unsigned char* work) const;
    bool applyOne(unsigned char* work, int number, bool toDevice) const;

    std::vector<std::string> conversions_;
    mutable KeptText error_;
    // What to say when a conversion fails, one text each: a read that fails takes no memory.
    std::vector<std::string> conversionErrors_;
};
