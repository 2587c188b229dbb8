#include "poll/Reasons.h"

#include <fmt/format.h>

#include "poll/Merging.h"

namespace poll {
namespace {

using std::chrono::nanoseconds;

std::string counted(long count, const char* word) {
    return fmt::format("{} {}{}", count, word, count == 1 ? "" : "s");
}

nanoseconds sumOfSingles(const Draft& draft, const AreaRules& rules) {
    nanoseconds sum{0};
    for (const AreaTag& tag : draft.tags)
        sum += rules.costOf(tag.extent);
    return sum;
}

std::string whyAlone(const Draft& draft, const AreaRules& rules) {
    if (!rules.limits.onLine) return "an area of the driver's own: nothing is sent";
    if (draft.extent.items() <= 0) return "has no items: the driver refuses it";
    return "reaches beyond the area: the driver refuses it";
}

std::string whyJoined(const Draft& draft, const AreaRules& rules) {
    const std::size_t tags = draft.tags.size();
    if (rules.isWide(draft.extent)) {
        const std::string cut =
            fmt::format("wider than a request: cut into {}", rules.requestsOf(draft.extent));
        return tags == 1 ? cut
                         : fmt::format("{}; it brings {} more", cut,
                                       counted(static_cast<long>(tags) - 1, "tag"));
    }
    if (tags == 1) return "one tag";
    const nanoseconds saved = sumOfSingles(draft, rules) - rules.costOf(draft.extent);
    const long filler = fillerOf(draft);
    if (filler == 0)
        return fmt::format("{} without a hole: saves {}", counted(static_cast<long>(tags), "tag"),
                           millisecondsText(saved));
    return fmt::format("{}, {} between them: saves {}", counted(static_cast<long>(tags), "tag"),
                       counted(filler, "filler item"), millisecondsText(saved));
}

std::string whySplit(const Draft& draft, const Draft& before, const AreaRules& rules) {
    if (rules.isWide(draft.extent)) return {};
    const long most = rules.limits.mostItems;
    const long end = std::max(draft.extent.end, before.extent.end);
    const long hole = draft.extent.first - before.extent.end;
    const nanoseconds apart = rules.costOf(before.extent) + rules.costOf(draft.extent);
    const Extent both{before.extent.first, end};
    if (before.alone || rules.isWide(before.extent)) return {};
    if (both.items() > most)
        return fmt::format("; {} with those in front, a request carries {}",
                           counted(both.items(), "item"), most);
    if (before.period != draft.period)
        return fmt::format("; apart from those in front, read every {} ms: together costs more",
                           before.period.count());
    return fmt::format("; a hole of {} in front: together costs {} more", counted(hole, "item"),
                       millisecondsText(rules.costOf(both) - apart));
}

}  // namespace

long fillerOf(const Draft& draft) {
    long filler = 0;
    long end = draft.extent.first;
    for (const AreaTag& tag : draft.tags) {
        filler += std::max(tag.extent.first - end, 0L);
        end = std::max(end, tag.extent.end);
    }
    return filler;
}

std::string reasonOf(const Draft& draft, const Draft* before, const AreaRules& rules) {
    if (draft.alone) return whyAlone(draft, rules);
    const std::string joined = whyJoined(draft, rules);
    return before == nullptr ? joined : joined + whySplit(draft, *before, rules);
}

std::string millisecondsText(nanoseconds time) {
    return fmt::format("{:.1f} ms", std::chrono::duration<double, std::milli>(time).count());
}

}  // namespace poll
