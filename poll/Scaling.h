// Values of devices in the units that people read: value = raw * scale + offset. Pure.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "poll/TagList.h"
#include "values/Json.h"
#include "values/LittleEndian.h"
#include "values/ValueTypes.h"

namespace poll {

/// @return true for numbers and arrays of numbers; booleans, texts and bytes have no scale.
inline bool canBeScaled(ICU_Type type) {
    return values::holdsNumbers(type);
}

/// How a tag's numbers are shown, and what is written for a number that a person gives.
class Scaling {
  public:
    /// Shows raw values as they are.
    Scaling() = default;
    /// As the list has it: a scale of 1, an offset of 0, and no more decimals than needed where
    /// nothing is given.
    explicit Scaling(const ListedTag& tag);

    /// @return true when values are shown as they come.
    [[nodiscard]] bool isPlain() const { return !decimals_ && isIdentity(); }

    /// @param raw  Run-time form, shape.bytes bytes.
    /// @return the value as text: numbers scaled, rounded to the decimals, those of an array
    /// separated by commas; values that can't be scaled as values::formatValue() has them.
    [[nodiscard]] std::string textOf(values::ValueShape shape, values::ByteView raw) const;

    /// @return the same as JSON: numbers where they are finite, as values::jsonValue() has them.
    [[nodiscard]] values::Json jsonOf(values::ValueShape shape, values::ByteView raw) const;

    /// @return the scaled numbers, one an item; none for values that can't be scaled. Not rounded;
    /// those of 64-bit integers may lose their last digits.
    [[nodiscard]] std::vector<double> numbersOf(values::ValueShape shape,
                                                values::ByteView raw) const;

    /// The way back, for writing. Integers are rounded to the nearest step of the scale.
    /// @return the raw value in run-time form, exactly shape.bytes bytes.
    /// Errors: ValueError when the text is no value of the type, lies outside the tag's low and
    /// high, or comes to a raw value out of the type's range.
    [[nodiscard]] values::Bytes rawOf(values::ValueShape shape, std::string_view text) const;

  private:
    [[nodiscard]] bool isIdentity() const { return scale_ == 1 && offset_ == 0; }
    [[nodiscard]] double scaled(double raw) const { return raw * scale_ + offset_; }
    [[nodiscard]] std::string itemText(const values::ValueType& type, values::ByteView raw) const;
    [[nodiscard]] std::uint64_t itemBits(const values::ValueType& type,
                                         std::string_view text) const;
    void checkLimits(std::string_view text) const;

    double scale_ = 1;
    double offset_ = 0;
    std::optional<int> decimals_;
    std::optional<double> low_;
    std::optional<double> high_;
};

}  // namespace poll
