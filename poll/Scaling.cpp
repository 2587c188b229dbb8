#include "poll/Scaling.h"

#include <fmt/format.h>

#include <bit>
#include <cmath>

#include "values/JsonValues.h"
#include "values/Numbers.h"
#include "values/ValueError.h"
#include "values/Values.h"

namespace poll {
namespace {

using values::Bytes;
using values::ByteView;
using values::Json;
using values::rowOf;
using values::ValueError;
using values::ValueKind;
using values::ValueShape;
using values::ValueType;

/// Digits that survive a way through the type: more would show what binary fractions are like.
constexpr int kFloatDigits = 7;
constexpr int kDoubleDigits = 15;

bool isWhole(const ValueType& type) {
    return type.kind == ValueKind::Signed || type.kind == ValueKind::Unsigned;
}

double rawNumber(const ValueType& type, ByteView raw) {
    const std::uint64_t bits = values::fromLittleEndian(raw);
    if (type.kind == ValueKind::Real) {
        return type.bytes == 4 ? std::bit_cast<float>(static_cast<std::uint32_t>(bits))
                               : std::bit_cast<double>(bits);
    }
    if (type.kind == ValueKind::Unsigned) return static_cast<double>(bits);
    const std::uint64_t sign = std::uint64_t{1} << (8U * type.bytes - 1);
    return static_cast<double>(static_cast<std::int64_t>((bits ^ sign) - sign));
}

std::string rounded(double number, int decimals) {
    std::string text = fmt::format("{:.{}f}", number, decimals);
    // Nobody reads "-0.00" as a number of its own.
    if (text.starts_with('-') && text.find_first_not_of("-0.") == std::string::npos)
        text.erase(0, 1);
    return text;
}

double numberIn(std::string_view text) {
    const ValueType& type = rowOf(ICU_Type::double_);
    return std::bit_cast<double>(values::parseReal(type, text));
}

/// Calls `take` with the bytes of each item.
template <class Take>
void forEachItem(ValueShape shape, ByteView raw, Take&& take) {
    const std::size_t bytes = values::itemRowOf(shape.type).bytes;
    for (std::size_t at = 0; at + bytes <= raw.size(); at += bytes)
        take(raw.subspan(at, bytes));
}

}  // namespace

Scaling::Scaling(const ListedTag& tag)
    : scale_(tag.scale.value_or(1)),
      offset_(tag.offset.value_or(0)),
      decimals_(tag.decimals),
      low_(tag.low),
      high_(tag.high) {}

std::string Scaling::itemText(const ValueType& type, ByteView raw) const {
    if (isPlain()) return values::formatItem(type, raw);
    const double number = scaled(rawNumber(type, raw));
    if (!std::isfinite(number)) return fmt::format("{}", number);
    // Not through a double, which would cost a 64-bit integer its last digits.
    if (isIdentity() && isWhole(type)) {
        const std::string text = values::formatItem(type, raw);
        return *decimals_ == 0 ? text : text + '.' + std::string(*decimals_, '0');
    }
    if (decimals_) return rounded(number, *decimals_);
    const bool isFloat = type.kind == ValueKind::Real && type.bytes == 4;
    return fmt::format("{:.{}g}", number, isFloat ? kFloatDigits : kDoubleDigits);
}

std::string Scaling::textOf(ValueShape shape, ByteView raw) const {
    if (isPlain() || !canBeScaled(shape.type)) return values::formatValue(shape, raw);
    std::string text;
    forEachItem(shape, raw, [&](ByteView item) {
        if (!text.empty()) text += ',';
        text += itemText(values::itemRowOf(shape.type), item);
    });
    return text;
}

Json Scaling::jsonOf(ValueShape shape, ByteView raw) const {
    if (isPlain() || !canBeScaled(shape.type)) return values::jsonValue(shape, raw);
    Json items = Json::array();
    forEachItem(shape, raw, [&](ByteView item) {
        const std::string text = itemText(values::itemRowOf(shape.type), item);
        const bool finite = std::isfinite(numberIn(text));
        items.push_back(finite ? Json::parse(text) : Json(text));
    });
    return rowOf(shape.type).kind == ValueKind::Array ? items : items.at(0);
}

std::vector<double> Scaling::numbersOf(ValueShape shape, ByteView raw) const {
    std::vector<double> numbers;
    if (!canBeScaled(shape.type)) return numbers;
    forEachItem(shape, raw, [&](ByteView item) {
        numbers.push_back(scaled(rawNumber(values::itemRowOf(shape.type), item)));
    });
    return numbers;
}

void Scaling::checkLimits(std::string_view text) const {
    if (!low_ && !high_) return;
    const double number = numberIn(text);
    if (low_ && !(number >= *low_))
        throw ValueError(fmt::format("'{}' is below the tag's low limit {}", text, *low_));
    if (high_ && !(number <= *high_))
        throw ValueError(fmt::format("'{}' is above the tag's high limit {}", text, *high_));
}

std::uint64_t Scaling::itemBits(const ValueType& type, std::string_view text) const {
    const double number = (numberIn(text) - offset_) / scale_;
    try {
        if (!isWhole(type)) return values::parseReal(type, fmt::format("{}", number));
        return values::parseWhole(type, fmt::format("{:.0f}", std::round(number)));
    } catch (const ValueError& error) {
        throw ValueError(fmt::format("'{}' as the device has it: {}", text, error.what()));
    }
}

Bytes Scaling::rawOf(ValueShape shape, std::string_view text) const {
    if (!canBeScaled(shape.type)) return values::parseValue(shape, text);
    const ValueType& type = values::itemRowOf(shape.type);
    const auto items = values::itemTexts(shape, text);
    for (const std::string_view item : items)
        checkLimits(values::trimmed(item));
    // Numbers that are shown as "12.00" are also written so; without a point the exact way will do.
    const bool exact = isIdentity() && (!decimals_ || text.find('.') == std::string_view::npos);
    if (exact) return values::parseValue(shape, text);
    Bytes raw;
    for (const std::string_view item : items)
        values::appendLittleEndian(raw, itemBits(type, values::trimmed(item)), type.bytes);
    return raw;
}

}  // namespace poll
