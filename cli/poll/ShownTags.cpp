// Turns states of tags into texts and numbers.
#include "cli/poll/ShownTags.h"

#include <algorithm>
#include <limits>

#include "values/JsonValues.h"
#include "values/Values.h"

namespace cli {

using poll::Quality;
using poll::TagState;
using values::ByteView;
using values::Json;
using values::ValueKind;
using values::ValueShape;

ShownTags::ShownTags(std::vector<poll::ListedTag> tags, std::vector<ValueShape> shapes)
    : tags_(std::move(tags)), shapes_(std::move(shapes)) {
    scalings_.reserve(tags_.size());
    for (const poll::ListedTag& tag : tags_)
        scalings_.emplace_back(tag);
}

std::string ShownTags::valueText(std::size_t tag, ByteView raw) const {
    return scalings_[tag].textOf(shapes_[tag], raw);
}

Json ShownTags::jsonValue(std::size_t tag, ByteView raw) const {
    const bool scaled = !scalings_[tag].isPlain() && poll::canBeScaled(shapes_[tag].type);
    if (!scaled) return values::jsonValue(shapes_[tag], raw);
    const bool isArray = values::rowOf(shapes_[tag].type).kind == ValueKind::Array;
    const std::string text = valueText(tag, raw);
    // The text is rounded to the decimals; infinite values are no JSON.
    Json numbers = Json::parse('[' + text + ']', nullptr, false);
    if (numbers.is_discarded() || numbers.empty()) return text;
    return isArray ? numbers : numbers.front();
}

double ShownTags::number(std::size_t tag, ByteView raw) const {
    const ValueShape shape = shapes_[tag];
    if (values::rowOf(shape.type).kind == ValueKind::Boolean)
        return !raw.empty() && raw[0] != 0 ? 1 : 0;
    const auto numbers = scalings_[tag].numbersOf(shape, raw);
    return numbers.empty() ? std::numeric_limits<double>::quiet_NaN() : numbers.front();
}

std::vector<std::string> ShownTags::searchTexts() const {
    std::vector<std::string> texts;
    texts.reserve(tags_.size());
    for (const poll::ListedTag& tag : tags_)
        texts.push_back(tag.name == tag.uri ? tag.name : tag.name + ' ' + tag.uri);
    return texts;
}

ListWidths ShownTags::widths(bool unicode) const {
    ListWidths widths;
    for (const poll::ListedTag& tag : tags_) {
        widths.name = std::max(widths.name, columnsOf(tag.name, unicode));
        widths.unit = std::max(widths.unit, columnsOf(tag.unit, unicode));
    }
    return widths;
}

void ValueHistory::note(const ShownTags& tags, const poll::Snapshot& snapshot) {
    if (rings_.size() != snapshot.tags.size()) rings_.assign(snapshot.tags.size(), {});
    for (std::size_t tag = 0; tag < rings_.size(); ++tag) {
        const TagState& state = snapshot.tags[tag];
        Ring& ring = rings_[tag];
        if (state.count == ring.count) continue;
        ring.count = state.count;
        ring.values[ring.next] = tags.number(tag, state.value);
        ring.next = (ring.next + 1) % kLength;
        ring.used = std::min(kLength, ring.used + 1);
    }
}

std::vector<double> ValueHistory::of(std::size_t tag) const {
    std::vector<double> values;
    if (tag >= rings_.size()) return values;
    const Ring& ring = rings_[tag];
    for (std::size_t i = 0; i < ring.used; ++i)
        values.push_back(ring.values[(ring.next + kLength - ring.used + i) % kLength]);
    return values;
}

TableRow ShownRows::row(std::size_t tag) const {
    TableRow row{.name = tags_.name(tag), .unit = tags_.unit(tag)};
    if (tag >= snapshot_.tags.size()) return row;
    const TagState& state = snapshot_.tags[tag];
    row.quality = state.quality;
    if (state.count > 0) {
        row.value = tags_.valueText(tag, state.value);
        row.age = std::chrono::duration_cast<std::chrono::milliseconds>(now_ - state.at);
    }
    if (state.error.code != 0) row.error = state.error.text;
    row.history = history_.of(tag);
    return row;
}

TableContent contentOf(const poll::Snapshot& snapshot, std::string notice) {
    TableContent content;
    for (const TagState& state : snapshot.tags) {
        QualityCounts& counts = content.counts;
        const bool good = state.quality == Quality::Good;
        const bool stale = state.quality == Quality::Stale;
        const bool bad = state.quality == Quality::Bad;
        ++(good ? counts.good : stale ? counts.stale : bad ? counts.bad : counts.never);
    }
    content.nodes = snapshot.nodes;
    content.line = snapshot.line;
    content.notice = std::move(notice);
    return content;
}

}  // namespace cli
