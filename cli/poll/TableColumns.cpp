// Shares the width of a terminal out among the columns.
#include "cli/poll/TableColumns.h"

#include <fmt/format.h>

#include <algorithm>

#include "cli/poll/Sparkline.h"

namespace cli {
namespace {

constexpr int kMark = 1;
constexpr int kGap = 1;
constexpr int kQuality = 7;
constexpr int kAge = 5;
constexpr int kHistory = 12;
constexpr int kShortestUnit = 4;
constexpr int kLongestUnit = 8;
constexpr int kShortestValue = 7;
constexpr int kLongestValue = 40;

// From this width on there is a column.
constexpr int kWithUnit = 36;
constexpr int kWithAge = 44;
constexpr int kWithQuality = 54;
constexpr int kWithHistory = 72;

struct Look {
    const char* mark;  ///< Tells the quality where colours and the column do not.
    CellStyle style;
};

Look lookOf(poll::Quality quality) {
    switch (quality) {
        case poll::Quality::Good:
            return {" ", CellStyle::Plain};
        case poll::Quality::Stale:
            return {"~", CellStyle::Warning};
        case poll::Quality::Bad:
            return {"!", CellStyle::Bad};
        case poll::Quality::Never:
            break;
    }
    return {"?", CellStyle::Dim};
}

/// What stands where the value is.
std::string shownValue(const TableRow& row) {
    const bool hasValue = row.quality == poll::Quality::Good || row.quality == poll::Quality::Stale;
    if (hasValue || row.error.empty()) return row.value;
    return row.error;
}

}  // namespace

TableColumns::TableColumns(int width, const TableStyle& style)
    : width_(width), unicode_(style.unicode) {
    if (width >= kWithUnit && style.widths.unit > 0)
        unit_ = std::clamp(style.widths.unit, kShortestUnit, kLongestUnit);
    if (width >= kWithAge) age_ = kAge;
    if (width >= kWithQuality) quality_ = kQuality;
    if (width >= kWithHistory) history_ = kHistory;
    int room = width - kMark - 2 * kGap;
    for (const int column : {unit_, age_, quality_, history_}) {
        if (column > 0) room -= column + kGap;
    }
    value_ = std::clamp(room * 2 / 5, std::min(kShortestValue, std::max(0, room)), kLongestValue);
    name_ = std::clamp(style.widths.name, 0, std::max(0, room - value_));
    value_ = std::clamp(room - name_, value_, kLongestValue);
}

ScreenLine TableColumns::titles() const {
    LineBuilder line(width_, unicode_);
    constexpr CellStyle title = CellStyle::Title;
    line.put("  ", title).putFitted("name", name_, title).put(" ", title);
    line.putFitted("value", value_, title, Align::Right);
    if (unit_ > 0) line.put(" ", title).putFitted("unit", unit_, title);
    if (quality_ > 0) line.put(" ", title).putFitted("quality", quality_, title);
    if (age_ > 0) line.put(" ", title).putFitted("age", age_, title, Align::Right);
    if (history_ > 0) line.put(" ", title).putFitted("last values", history_, title);
    return line.putFitted("", line.room(), title).take();
}

ScreenLine TableColumns::line(const TableRow& row) const {
    const Look look = lookOf(row.quality);
    LineBuilder line(width_, unicode_);
    line.put(look.mark, look.style).put(" ").putFitted(row.name, name_).put(" ");
    line.putFitted(shownValue(row), value_, look.style, Align::Right);
    if (unit_ > 0) line.put(" ").putFitted(row.unit, unit_);
    if (quality_ > 0) line.put(" ").putFitted(qualityName(row.quality), quality_, look.style);
    if (age_ > 0)
        line.put(" ").putFitted(row.age ? ageText(*row.age) : "", age_, look.style, Align::Right);
    if (history_ > 0) line.put(" ").putFitted(sparkline(row.history, kHistory, unicode_), history_);
    return line.take();
}

}  // namespace cli
