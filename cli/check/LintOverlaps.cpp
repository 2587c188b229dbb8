// The rules that look at tags side by side.
#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <utility>

#include "cli/ValueTypes.h"
#include "cli/check/FirstMeetings.h"
#include "cli/check/LintTags.h"

namespace cli {
namespace {

/// The bits of an area that a tag stands for, `end` excluded, and the items that hold them.
struct Span {
    const TagLine* tag;
    std::size_t order;  ///< In the text.
    ICU_Type item;      ///< Type of one value.
    long long begin;
    long long end;
    long long itemBits;  ///< Of the area.
    bool readOnly;

    [[nodiscard]] bool isBits() const { return item == ICU_Type::boolean; }
    [[nodiscard]] long long firstItem() const { return begin / itemBits; }
    [[nodiscard]] long long endItem() const { return (end + itemBits - 1) / itemBits; }
};

const ValueType* typeNamed(const std::string& name) {
    for (const ValueType& row : kValueTypes) {
        if (row.name == name) return &row;
    }
    return nullptr;
}

Span spanOf(const TagLine& tag, std::size_t order, const AreaInfo& area) {
    const TagFacts& facts = *tag.facts;
    const ICU_Type item = facts.itemType == ICU_Type::none ? facts.type : facts.itemType;
    const ValueType* natural = typeNamed(area.naturalType);
    const bool bitArea = natural != nullptr && natural->type == ICU_Type::boolean;
    const long long itemBits = bitArea || natural == nullptr ? 1 : natural->bytes * 8LL;
    const bool bits = item == ICU_Type::boolean;
    // In a bit area the driver counts in bytes and the bits within; in registers, in registers.
    const long long unit = bitArea ? 8 : itemBits;
    const long long shift = bitArea || bits ? facts.bitIndex : 0;
    const long long begin = facts.byteOffset * unit + shift;
    const long long length = bits ? facts.length : facts.length * 8LL;
    return {&tag, order, item, begin, begin + std::max(length, 0LL), itemBits, facts.readOnly};
}

std::string describe(const Span& span) {
    return fmt::format("'{}' ({}:{})", span.tag->uri, span.tag->place.source, span.tag->place.line);
}

Finding sharedRegister(const Span& bit, const Span& owner) {
    return {Severity::Warning, "shared-register", bit.tag->placeOf(2),
            fmt::format("writing a bit rewrites the register that {} owns", describe(owner)),
            "write it through one of the two tags only"};
}

Finding overlap(const Span& later, const Span& earlier) {
    return {Severity::Warning, "overlap", later.tag->placeOf(2),
            fmt::format("overlaps {} with another data type", describe(earlier)),
            "check the address and the data type of both"};
}

using Area = std::pair<int, std::string>;  // Node and name.

std::map<Area, std::vector<Span>> spansByArea(const std::vector<TagLine>& tags,
                                              const Description& description) {
    std::map<Area, std::vector<Span>> areas;
    for (std::size_t i = 0; i < tags.size(); ++i) {
        if (!tags[i].wellFormed() || !tags[i].facts) continue;
        const AreaInfo* area = description.area(tags[i].area());
        if (area == nullptr) continue;
        areas[{tags[i].facts->node, area->name}].push_back(spanOf(tags[i], i, *area));
    }
    return areas;
}

using Reports = std::map<std::size_t, Finding>;  ///< By the order of the tag.

/// Gives a number to each kind of values: type and place in the raster of its length. Values of one
/// kind are the same wherever they meet: those of an array and one of its items, say.
class Kinds {
  public:
    int of(const Span& span) {
        const long long bits = std::max<long long>(rowOf(span.item).bytes, 1) * 8;
        const long long phase = (span.begin % bits + bits) % bits;
        const auto next = static_cast<int>(numbers_.size());
        return numbers_.try_emplace({span.item, phase}, next).first->second;
    }

  private:
    std::map<std::pair<ICU_Type, long long>, int> numbers_;
};

/// Values that lie on values of another kind are reported further down in the text.
void lintValues(const std::vector<Span>& values, Reports& out) {
    std::vector<Stretch> stretches;
    stretches.reserve(values.size());
    Kinds kinds;
    for (const Span& each : values)
        stretches.push_back({each.begin, each.end, kinds.of(each)});
    const auto met = firstMeetings(stretches, stretches);
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (met[i] && *met[i] < i)
            out.emplace(values[i].order, overlap(values[i], values[*met[i]]));
    }
}

/// Bits that can be written are reported where a register is also part of a value. Reading the bits
/// of a status word beside the word is what status words are for.
void lintBits(const std::vector<Span>& bits, const std::vector<Span>& values, Reports& out) {
    const auto items = [](const std::vector<Span>& spans, int kind) {
        std::vector<Stretch> stretches;
        stretches.reserve(spans.size());
        for (const Span& each : spans)
            stretches.push_back({each.firstItem(), each.endItem(), kind});
        return stretches;
    };
    const auto met = firstMeetings(items(bits, kNoKind), items(values, 0));
    for (std::size_t i = 0; i < bits.size(); ++i) {
        if (met[i] && !bits[i].readOnly)
            out.emplace(bits[i].order, sharedRegister(bits[i], values[*met[i]]));
    }
}

}  // namespace

Findings lintOverlaps(const std::vector<TagLine>& tags, const Description& description) {
    Reports reports;
    for (auto& [area, spans] : spansByArea(tags, description)) {
        const auto middle = std::stable_partition(spans.begin(), spans.end(),
                                                  [](const Span& each) { return each.isBits(); });
        const std::vector<Span> bits(spans.begin(), middle);
        const std::vector<Span> values(middle, spans.end());
        lintValues(values, reports);
        lintBits(bits, values, reports);
    }
    Findings out;
    for (auto& [order, finding] : reports)
        out.push_back(std::move(finding));
    return out;
}

}  // namespace cli
