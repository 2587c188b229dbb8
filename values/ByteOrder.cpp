#include "values/ByteOrder.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <array>
#include <cctype>
#include <cstdlib>
#include <vector>

#include "values/Numbers.h"
#include "values/ValueError.h"
#include "values/ValueTypes.h"

namespace values {
namespace {

// The driver swaps the two bytes of each register, and takes the first register for the low one.
// So a number whose low register comes first needs nothing; swap2, swap4 and swap8 each turn the
// bytes of every 2, 4 and 8 round.
constexpr std::array kOrders{
    ByteOrder{"AB", ""},
    ByteOrder{"BA", "swap2"},
    ByteOrder{"ABCD", "swap2,swap4"},
    ByteOrder{"CDAB", ""},
    ByteOrder{"DCBA", "swap2"},
    ByteOrder{"BADC", "swap4"},
    ByteOrder{"ABCDEFGH", "swap2,swap8"},
    ByteOrder{"GHEFCDAB", ""},
    ByteOrder{"HGFEDCBA", "swap2"},
    ByteOrder{"BADCFEHG", "swap8"},
    ByteOrder{"EFGHABCD", "swap2,swap4"},
    ByteOrder{"CDABGHEF", "swap4,swap8"},
    ByteOrder{"DCBAHGFE", "swap2,swap4,swap8"},
    ByteOrder{"FEHGBADC", "swap4"},
};

// A 32-bit register travels with its most significant byte first.
constexpr std::array kLongOrders{
    ByteOrder{"ABCD", ""},
    ByteOrder{"CDAB", "swap2,swap4"},
    ByteOrder{"DCBA", "swap4"},
    ByteOrder{"BADC", "swap2"},
};

// A string of bytes is no number: its first byte is A, wherever the numbers have their last.
constexpr std::array kTextOrders{
    ByteOrder{"AB", "swap2"},
    ByteOrder{"BA", ""},
};

constexpr std::size_t kFieldCount = 4;
constexpr std::size_t kAreaField = 1;
constexpr std::size_t kTypeField = 3;

[[noreturn]] void refuse(const std::string& text) {
    throw ValueError(text);
}

std::vector<std::string> split(std::string_view text, char separator) {
    std::vector<std::string> parts;
    for (;;) {
        const std::size_t end = text.find(separator);
        parts.emplace_back(text.substr(0, end));
        if (end == std::string_view::npos) return parts;
        text.remove_prefix(end + 1);
    }
}

std::string upper(std::string_view text) {
    std::string result(text);
    std::transform(result.begin(), result.end(), result.begin(),
                   [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
    return result;
}

/// A data type with an order, taken apart.
struct OrderedType {
    std::string name;         ///< "float-4".
    std::string conversions;  ///< What stood in parentheses.
    std::string order;        ///< In capitals.
};

OrderedType takeApart(std::string text) {
    OrderedType type;
    const std::size_t at = text.find('@');
    const std::size_t end = std::min(text.find('(', at), text.size());
    type.order = upper(trimmed(std::string_view(text).substr(at + 1, end - at - 1)));
    text.erase(at, end - at);
    const std::size_t open = text.find('(');
    type.name = trimmed(std::string_view(text).substr(0, open));
    if (open == std::string::npos) return type;
    const std::size_t close = text.find(')', open);
    if (close == std::string::npos) refuse("a conversion list ends in ')'");
    type.conversions = trimmed(std::string_view(text).substr(open + 1, close - open - 1));
    return type;
}

/// @return the row of a type as a URI writes it; null for an unknown type.
const ValueType* rowOfName(std::string_view name) {
    const std::size_t dash = name.find('-');
    if (dash != std::string_view::npos) name = name.substr(0, dash + 1);
    const auto row = std::find_if(kValueTypes.begin(), kValueTypes.end(),
                                  [name](const ValueType& each) { return each.name == name; });
    return row != kValueTypes.end() ? &*row : nullptr;
}

std::vector<ByteOrder> ofLength(std::span<const ByteOrder> orders, std::size_t bytes) {
    std::vector<ByteOrder> fitting;
    for (const ByteOrder& each : orders) {
        if (each.name.size() == bytes) fitting.push_back(each);
    }
    return fitting;
}

bool isStringOfBytes(const ValueType& row) {
    return row.kind == ValueKind::Text || row.kind == ValueKind::Binary ||
           row.item == ICU_Type::byte || row.item == ICU_Type::unsignedByte;
}

/// @return whether an array's or a text's last register is full.
bool fillsRegisters(const std::string& typeName) {
    return std::strtol(typeName.c_str() + typeName.find('-') + 1, nullptr, 10) % 2 == 0;
}

/// @return the orders that values of the type can have in the area.
std::vector<ByteOrder> choicesFor(const OrderedType& type, const ValueType& row,
                                  std::string_view area) {
    // The line's settings never travel on it.
    if (area.starts_with("SP_")) return {};
    if (area == "LONG") return ofLength(kLongOrders, row.bytes);
    if (!isStringOfBytes(row)) return ofLength(kOrders, row.bytes);
    if (!fillsRegisters(type.name)) refuse(type.name + " has no byte order: an odd length");
    return {kTextOrders.begin(), kTextOrders.end()};
}

const ByteOrder& chosen(const OrderedType& type, const std::vector<ByteOrder>& choices) {
    if (choices.empty()) refuse(type.name + " has no byte order here");
    const auto found = std::find_if(choices.begin(), choices.end(),
                                    [&](const ByteOrder& each) { return each.name == type.order; });
    if (found != choices.end()) return *found;
    std::vector<std::string_view> names;
    names.reserve(choices.size());
    for (const ByteOrder& each : choices)
        names.push_back(each.name);
    refuse(fmt::format("'{}' is no byte order of {}: {}", type.order, type.name,
                       fmt::join(names, ", ")));
}

void refuseSwaps(const OrderedType& type) {
    for (const std::string& name : split(type.conversions, ',')) {
        if (trimmed(name).starts_with("swap") && trimmed(name) != "swapnibble") {
            refuse(fmt::format("a byte order by name takes the place of {}", trimmed(name)));
        }
    }
}

/// The order is what the line does to the value, so its conversions come last: a driver applies
/// them last when it writes and first when it reads.
std::string withConversions(const OrderedType& type, std::string_view more) {
    std::string all = type.conversions;
    if (!all.empty() && !more.empty()) all += ',';
    all += more;
    return all.empty() ? type.name : fmt::format("{}({})", type.name, all);
}

std::string plainType(const std::string& text, std::string_view area) {
    const OrderedType type = takeApart(text);
    const ValueType* const row = rowOfName(type.name);
    // What is no type at all is for the driver to refuse.
    if (row == nullptr) return withConversions(type, {});
    refuseSwaps(type);
    return withConversions(type, chosen(type, choicesFor(type, *row, area)).conversions);
}

}  // namespace

std::span<const ByteOrder> byteOrders() {
    return kOrders;
}

std::string withoutByteOrder(const std::string& uri) {
    std::vector<std::string> fields = split(uri, '?');
    if (fields.size() != kFieldCount) return uri;
    if (fields[kTypeField].find('@') == std::string::npos) return uri;
    fields[kTypeField] = plainType(fields[kTypeField], trimmed(fields[kAreaField]));
    return fmt::format("{}", fmt::join(fields, "?"));
}

}  // namespace values
