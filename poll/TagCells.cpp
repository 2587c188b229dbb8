#include "poll/TagCells.h"

#include <fmt/format.h>

#include <algorithm>
#include <charconv>
#include <cmath>

#include "values/Numbers.h"

namespace poll {
namespace {

using std::chrono::milliseconds;

constexpr milliseconds kLongestPeriod = std::chrono::hours(24);
/// More digits than a double has.
constexpr int kMostDecimals = 15;

std::optional<double> numberOf(std::string_view text) {
    if (text.starts_with('+') && !text.starts_with("+-")) text.remove_prefix(1);
    double number = 0;
    const auto [stop, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    const bool whole = stop == text.data() + text.size();
    if (error != std::errc{} || !whole || !std::isfinite(number)) return std::nullopt;
    return number;
}

/// @return what to say of a text that is no number, where `what` was expected.
std::string noNumber(const std::string& text, const char* what) {
    std::string pointed = text;
    std::replace(pointed.begin(), pointed.end(), ',', '.');
    if (pointed != text && numberOf(pointed)) {
        return fmt::format("'{}' has a decimal comma: expected {} with a decimal point, {}", text,
                           what, pointed);
    }
    return fmt::format("'{}': expected {}", text, what);
}

void takeNumber(std::optional<double>& number, const CsvCell& cell, Complaints& complaints) {
    number = numberOf(cell.text);
    if (!number) complaints.add("not-a-number", cell, noNumber(cell.text, "a number"));
}

/// Refuses what would tear the lines of an output that names the tag.
bool holdsControls(const CsvCell& cell, const char* what, Complaints& complaints) {
    const auto isControl = [](char each) {
        return static_cast<unsigned char>(each) < ' ' || each == '\x7F';
    };
    if (std::none_of(cell.text.begin(), cell.text.end(), isControl)) return false;
    complaints.add(
        "control-character", cell,
        fmt::format("a line end or another control character: expected {} without", what));
    return true;
}

void takeName(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    if (holdsControls(cell, "a name", complaints)) return;
    if (cell.text.find('=') != std::string::npos) {
        return complaints.add(
            "name-with-equals", cell,
            fmt::format("'{}': expected a name without '=', which ends it where values are written",
                        cell.text));
    }
    tag.name = cell.text;
}

void takeUri(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    if (!holdsControls(cell, "a URI", complaints)) tag.uri = cell.text;
}

/// Takes "ms" or "s" off the end. @return the milliseconds of one.
double takeUnit(std::string_view& text) {
    const bool millis = text.ends_with("ms");
    const bool seconds = !millis && text.ends_with("s");
    if (millis || seconds) text.remove_suffix(millis ? 2 : 1);
    text = values::trimmed(text);
    return seconds ? 1000 : 1;
}

void takePeriod(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    constexpr const char* kExpected = "milliseconds, e.g. 500, or 500ms, or 2s";
    std::string_view text = cell.text;
    const double unit = takeUnit(text);
    const auto number = numberOf(text);
    if (!number) {
        return complaints.add("not-a-number", cell, noNumber(cell.text, kExpected));
    }
    const double millis = *number * unit;
    const bool fits = millis >= 1 && millis <= static_cast<double>(kLongestPeriod.count());
    if (!fits || std::round(millis) != millis) {
        return complaints.add(
            "bad-period", cell,
            fmt::format("'{}': expected a period of whole milliseconds, from 1 to {}", cell.text,
                        kLongestPeriod.count()));
    }
    tag.period = milliseconds(static_cast<long long>(millis));
}

void takeScale(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    takeNumber(tag.scale, cell, complaints);
    if (tag.scale != 0.0) return;
    tag.scale.reset();
    complaints.add("zero-scale", cell, "a scale of 0 hides every value: expected another number");
}

void takeOffset(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    takeNumber(tag.offset, cell, complaints);
}

void takeLow(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    takeNumber(tag.low, cell, complaints);
}

void takeHigh(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    takeNumber(tag.high, cell, complaints);
}

void takeUnitName(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    if (!holdsControls(cell, "a unit", complaints)) tag.unit = cell.text;
}

void takeDecimals(ListedTag& tag, const CsvCell& cell, Complaints& complaints) {
    const auto number = numberOf(cell.text);
    if (number && *number >= 0 && *number <= kMostDecimals && std::round(*number) == *number) {
        tag.decimals = static_cast<int>(*number);
        return;
    }
    complaints.add("bad-decimals", cell,
                   fmt::format("'{}': expected the digits behind the decimal point, 0 to {}",
                               cell.text, kMostDecimals));
}

void takeComment(ListedTag& tag, const CsvCell& cell, Complaints& /*complaints*/) {
    tag.comment = cell.text;
}

}  // namespace

const std::array<ListColumn, 10> kListColumns{
    ListColumn{"name", takeName, &CellColumns::name, "empty-name"},
    ListColumn{"uri", takeUri, &CellColumns::uri, "empty-uri"},
    ListColumn{"period", takePeriod, &CellColumns::period},
    ListColumn{"scale", takeScale, &CellColumns::scale},
    ListColumn{"offset", takeOffset, &CellColumns::offset},
    ListColumn{"unit", takeUnitName},
    ListColumn{"decimals", takeDecimals, &CellColumns::decimals},
    ListColumn{"low", takeLow, &CellColumns::low},
    ListColumn{"high", takeHigh},
    ListColumn{"comment", takeComment}};

std::string listColumnNames() {
    std::string names;
    for (const ListColumn& column : kListColumns) {
        if (!names.empty()) names += ", ";
        names += column.name;
    }
    return names;
}

}  // namespace poll
