// The rules that look at tags side by side.
#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <utility>

#include "lint/AreaSpans.h"
#include "lint/FirstMeetings.h"
#include "lint/LintTags.h"
#include "values/ValueTypes.h"

namespace lint {
namespace {

using settings::Description;

Finding sharedRegister(const Span& bit, const Span& owner) {
    return {Severity::Warning, "shared-register", bit.tag->placeOf(2),
            fmt::format("writing a bit rewrites the register that {} owns", placed(owner)),
            "write it through one of the two tags only"};
}

Finding overlap(const Span& later, const Span& earlier) {
    return {Severity::Warning, "overlap", later.tag->placeOf(2),
            fmt::format("overlaps {} with another data type", placed(earlier)),
            "check the address and the data type of both"};
}

using Reports = std::map<std::size_t, Finding>;  ///< By the order of the tag.

/// Gives a number to each kind of values: type and place in the raster of its length. Values of one
/// kind are the same wherever they meet: those of an array and one of its items, say.
class Kinds {
  public:
    int of(const Span& span) {
        const long long bits = std::max<long long>(values::rowOf(span.item).bytes, 1) * 8;
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

}  // namespace lint
