// What only a list of tags can have wrong.
#include <fmt/format.h>

#include "lint/AreaSpans.h"
#include "lint/FirstMeetings.h"
#include "lint/LintTags.h"
#include "values/ValueTypes.h"

namespace lint {
namespace {

/// @return the tag's name, or its URI where it has none.
const std::string& calledBy(const TagLine& tag) {
    return tag.listed.name.empty() ? tag.uri : tag.listed.name;
}

void lintScale(const TagLine& tag, Findings& out) {
    if (tag.listed.scaledBy == nullptr || !tag.facts || values::holdsNumbers(tag.facts->type))
        return;
    warn(out, "unused-scale", tag.listed.scalePlace,
         fmt::format("'{}' holds no number: {} has no effect", calledBy(tag), tag.listed.scaledBy),
         "leave the field empty, or check the data type");
}

void lintLimits(const TagLine& tag, Findings& out) {
    const ListFacts& listed = tag.listed;
    if (!listed.low || !listed.high || *listed.low <= *listed.high) return;
    warn(out, "swapped-limits", listed.limitsPlace,
         fmt::format("the low limit of '{}', {}, is above its high limit, {}: nothing can be "
                     "written",
                     calledBy(tag), *listed.low, *listed.high),
         "exchange them");
}

Finding twoPeriods(const TagLine& later, const TagLine& earlier) {
    return {Severity::Warning, "two-periods", later.listed.periodPlace,
            fmt::format("'{}' is wanted every {} ms, and '{}' ({}:{}) on the same items every {} "
                        "ms",
                        calledBy(later), *later.listed.period, calledBy(earlier),
                        earlier.place.source, earlier.place.line, *earlier.listed.period),
            "give both the same period, or they show different values for a while"};
}

/// Items that two tags read at different periods are reported further down in the text.
void lintPeriods(const std::vector<Span>& spans, Findings& out) {
    std::vector<const Span*> timed;
    std::vector<Stretch> stretches;
    std::map<long long, int> kinds;  // By period.
    for (const Span& each : spans) {
        if (!each.tag->listed.period) continue;
        const auto next = static_cast<int>(kinds.size());
        const int kind = kinds.try_emplace(*each.tag->listed.period, next).first->second;
        timed.push_back(&each);
        stretches.push_back({each.firstItem(), each.endItem(), kind});
    }
    const auto met = firstMeetings(stretches, stretches);
    for (std::size_t i = 0; i < timed.size(); ++i) {
        if (met[i] && *met[i] < i) out.push_back(twoPeriods(*timed[i]->tag, *timed[*met[i]]->tag));
    }
}

}  // namespace

Findings lintList(const std::vector<TagLine>& tags, const settings::Description& description) {
    Findings out;
    for (const TagLine& tag : tags) {
        lintScale(tag, out);
        lintLimits(tag, out);
    }
    for (const auto& [area, spans] : spansByArea(tags, description))
        lintPeriods(spans, out);
    return out;
}

}  // namespace lint
