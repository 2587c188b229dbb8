#include "values/JsonValues.h"

#include <charconv>
#include <cmath>

#include "values/Numbers.h"
#include "values/TextEscapes.h"
#include "values/Values.h"

namespace values {
namespace {

/// JSON knows one kind of number; the shortest text of a float, read as a double, is what prints
/// as the same short text again.
Json jsonReal(const ValueType& type, std::uint64_t bits) {
    const std::string text = formatReal(type, bits);
    double number = 0;
    const auto [stop, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    const bool plain = error == std::errc{} && std::isfinite(number);
    return plain ? Json(number) : Json(text);
}

Json jsonWhole(const ValueType& type, std::uint64_t bits) {
    if (type.kind == ValueKind::Unsigned) return bits;
    const std::uint64_t sign = std::uint64_t{1} << (8U * type.bytes - 1);
    return static_cast<std::int64_t>((bits ^ sign) - sign);
}

Json jsonText(ByteView padded) {
    const ByteView text = withoutPadding(padded);
    for (std::size_t at = 0; at < text.size();) {
        const std::size_t length = utf8Length(text.subspan(at));
        if (length == 0) return Json(Bytes(text.begin(), text.end()));
        at += length;
    }
    return std::string(text.begin(), text.end());
}

Json jsonItem(const ValueType& type, ByteView value) {
    switch (type.kind) {
        case ValueKind::Boolean:
            return value[0] != 0;
        case ValueKind::Signed:
        case ValueKind::Unsigned:
            return jsonWhole(type, fromLittleEndian(value));
        case ValueKind::Real:
            return jsonReal(type, fromLittleEndian(value));
        case ValueKind::Text:
            return jsonText(value);
        default:
            return formatItem(type, value);
    }
}

}  // namespace

Json jsonValue(ValueShape shape, ByteView value) {
    const ValueType& row = rowOf(shape.type);
    if (row.kind != ValueKind::Array) return jsonItem(row, value);
    const ValueType& item = rowOf(row.item);
    Json items = Json::array();
    for (std::size_t i = 0; i < itemCount(shape); ++i) {
        items.push_back(jsonItem(item, value.subspan(i * item.bytes, item.bytes)));
    }
    return items;
}

}  // namespace values
