// The rules that look at tags side by side.
#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <tuple>
#include <utility>

#include "cli/ValueTypes.h"
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

bool share(long long beginA, long long endA, long long beginB, long long endB) {
    return beginA < endB && beginB < endA;
}

/// One value of both is the same: an array and one of its items, say.
bool sameValues(const Span& a, const Span& b) {
    const long long bytes = rowOf(a.item).bytes;
    return a.item == b.item && (a.begin - b.begin) % (bytes * 8) == 0;
}

std::string describe(const Span& span) {
    return fmt::format("'{}' ({}:{})", span.tag->uri, span.tag->place.source, span.tag->place.line);
}

/// @return what is wrong between two tags of one area; `later` stands further down in the text.
std::optional<Finding> conflict(const Span& earlier, const Span& later) {
    if (earlier.isBits() && later.isBits()) return std::nullopt;
    if (earlier.isBits() || later.isBits()) {
        const bool shared =
            share(earlier.firstItem(), earlier.endItem(), later.firstItem(), later.endItem());
        // Reading the bits of a status word beside the word is what status words are for.
        if (!shared || later.readOnly) return std::nullopt;
        const Span& bit = earlier.isBits() ? earlier : later;
        const Span& owner = earlier.isBits() ? later : earlier;
        return Finding{
            Severity::Warning, "shared-register", bit.tag->placeOf(2),
            fmt::format("writing a bit rewrites the register that {} owns", describe(owner)),
            "write it through one of the two tags only"};
    }
    if (!share(earlier.begin, earlier.end, later.begin, later.end)) return std::nullopt;
    if (sameValues(earlier, later)) return std::nullopt;
    return Finding{Severity::Warning, "overlap", later.tag->placeOf(2),
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

/// Goes through the tags from low to high addresses; `open` holds those that reach further.
void sweep(std::vector<Span>& spans,
           std::map<const TagLine*, std::pair<std::size_t, Finding>>& out) {
    const auto byBegin = [](const Span& a, const Span& b) {
        return std::tuple(a.firstItem(), a.begin, a.order) <
               std::tuple(b.firstItem(), b.begin, b.order);
    };
    std::sort(spans.begin(), spans.end(), byBegin);
    std::vector<const Span*> open;
    for (const Span& span : spans) {
        std::erase_if(open, [&](const Span* each) { return each->endItem() <= span.firstItem(); });
        for (const Span* other : open) {
            const bool inOrder = other->order < span.order;
            const Span& earlier = inOrder ? *other : span;
            const Span& later = inOrder ? span : *other;
            const auto finding = conflict(earlier, later);
            if (!finding) continue;
            // The tag that is reported, and the one that it meets.
            const bool atLater = finding->place == later.tag->placeOf(2);
            const Span& reported = atLater ? later : earlier;
            const Span& met = atLater ? earlier : later;
            const auto known = out.find(reported.tag);
            if (known == out.end() || met.order < known->second.first) {
                out.insert_or_assign(reported.tag, std::pair(met.order, *finding));
            }
        }
        open.push_back(&span);
    }
}

}  // namespace

Findings lintOverlaps(const std::vector<TagLine>& tags, const Description& description) {
    std::map<const TagLine*, std::pair<std::size_t, Finding>> reported;
    for (auto& [area, spans] : spansByArea(tags, description))
        sweep(spans, reported);
    Findings out;
    for (const TagLine& tag : tags) {
        const auto finding = reported.find(&tag);
        if (finding != reported.end()) out.push_back(finding->second.second);
    }
    return out;
}

}  // namespace cli
