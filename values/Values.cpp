#include "values/Values.h"

#include <fmt/format.h>

#include <algorithm>
#include <charconv>

#include "values/Numbers.h"
#include "values/TextEscapes.h"
#include "values/ValueError.h"

namespace values {
namespace {

[[noreturn]] void refuse(const std::string& why) {
    throw ValueError(why);
}

void appendItem(Bytes& out, const ValueType& type, std::string_view text) {
    std::uint64_t bits = 0;
    if (type.kind == ValueKind::Boolean) {
        bits = parseBoolean(text);
    } else if (type.kind == ValueKind::Real) {
        bits = parseReal(type, text);
    } else {
        bits = parseWhole(type, text);
    }
    appendLittleEndian(out, bits, type.bytes);
}

Bytes parseText(ValueShape shape, std::string_view text) {
    Bytes bytes = unescapeText(text);
    if (bytes.size() > shape.bytes) {
        refuse(fmt::format("text of {} bytes is too long for {}", bytes.size(), typeName(shape)));
    }
    bytes.resize(shape.bytes);
    return bytes;
}

Bytes parseBinary(ValueShape shape, std::string_view text) {
    std::string_view digits = trimmed(text);
    if (digits.starts_with("0x") || digits.starts_with("0X")) digits.remove_prefix(2);
    if (digits.size() != 2 * shape.bytes) {
        refuse(fmt::format("{} needs {} hexadecimal digits, not {}", typeName(shape),
                           2 * shape.bytes, digits.size()));
    }
    Bytes bytes;
    for (std::size_t at = 0; at < digits.size(); at += 2) {
        std::uint8_t byte = 0;
        const char* const pair = digits.data() + at;
        const auto [stop, error] = std::from_chars(pair, pair + 2, byte, 16);
        if (error != std::errc{} || stop != pair + 2) {
            refuse(fmt::format("'{}' is no hexadecimal byte ({})", digits.substr(at, 2),
                               typeName(shape)));
        }
        bytes.push_back(byte);
    }
    return bytes;
}

std::vector<std::string_view> splitAtCommas(std::string_view text) {
    std::vector<std::string_view> items;
    if (trimmed(text).empty()) return items;
    for (std::size_t comma = text.find(','); comma != std::string_view::npos;
         comma = text.find(',')) {
        items.push_back(text.substr(0, comma));
        text.remove_prefix(comma + 1);
    }
    items.push_back(text);
    return items;
}

Bytes parseArray(ValueShape shape, std::string_view text) {
    const ValueType& item = rowOf(rowOf(shape.type).item);
    Bytes bytes;
    for (const std::string_view each : itemTexts(shape, text))
        appendItem(bytes, item, each);
    return bytes;
}

std::string formatArray(ValueShape shape, ByteView value) {
    const ValueType& item = rowOf(rowOf(shape.type).item);
    std::string text;
    for (std::size_t i = 0; i < itemCount(shape); ++i) {
        if (i != 0) text += ',';
        text += formatItem(item, value.subspan(i * item.bytes, item.bytes));
    }
    return text;
}

}  // namespace

std::vector<std::string_view> itemTexts(ValueShape shape, std::string_view text) {
    if (rowOf(shape.type).kind != ValueKind::Array) return {text};
    std::vector<std::string_view> items = splitAtCommas(text);
    if (items.size() != itemCount(shape)) {
        refuse(fmt::format("{} needs {} items, not {}", typeName(shape), itemCount(shape),
                           items.size()));
    }
    return items;
}

Bytes parseValue(ValueShape shape, std::string_view text) {
    const ValueType& row = rowOf(shape.type);
    switch (row.kind) {
        case ValueKind::Text:
            return parseText(shape, text);
        case ValueKind::Binary:
            return parseBinary(shape, text);
        case ValueKind::Array:
            return parseArray(shape, text);
        case ValueKind::Opaque:
            refuse(fmt::format("values of type {} can't be written as text", row.name));
        default: {
            Bytes bytes;
            appendItem(bytes, row, text);
            return bytes;
        }
    }
}

std::string formatItem(const ValueType& type, ByteView value) {
    switch (type.kind) {
        case ValueKind::Boolean:
            return value[0] != 0 ? "1" : "0";
        case ValueKind::Signed:
        case ValueKind::Unsigned:
            return formatWhole(type, fromLittleEndian(value));
        case ValueKind::Real:
            return formatReal(type, fromLittleEndian(value));
        case ValueKind::Text:
            return '"' + escapeText(withoutPadding(value)) + '"';
        default: {
            std::string text = "0x";
            for (const std::uint8_t byte : value)
                text += fmt::format("{:02x}", byte);
            return text;
        }
    }
}

std::string formatValue(ValueShape shape, ByteView value) {
    const ValueType& row = rowOf(shape.type);
    return row.kind == ValueKind::Array ? formatArray(shape, value) : formatItem(row, value);
}

ByteView withoutPadding(ByteView text) {
    const auto last = std::find_if(text.rbegin(), text.rend(), [](auto byte) { return byte != 0; });
    return text.first(static_cast<std::size_t>(text.rend() - last));
}

}  // namespace values
