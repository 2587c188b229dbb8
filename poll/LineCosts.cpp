#include "poll/LineCosts.h"

#include <algorithm>

#include "settings/LineFormat.h"
#include "settings/NodeValue.h"

namespace poll {

using std::chrono::milliseconds;

milliseconds driverGap(int baud) {
    constexpr int kBits = 12 * 10;
    if (baud <= 0) return milliseconds{1};
    return std::chrono::ceil<milliseconds>(wire::timeOfCharacters(1, {baud, kBits}));
}

CostModel costsOf(const settings::ScannedConfig& config, const settings::Description& description,
                  std::span<const int> nodes, const LineHabits& habits) {
    const settings::LineFormat format = settings::lineFormatOf(config);
    CostModel costs;
    costs.rate = format.rate;
    costs.mode = format.mode;
    if (!habits.endsByLength)
        costs.gapAfterReply = std::max(driverGap(format.rate.baud), habits.shortestGap);
    costs.turnaround = habits.turnaround;
    for (const int node : nodes) {
        const auto delay = settings::nodeValue(config, description, node, "delay");
        if (delay && delay->value > 0) costs.delays[node] = milliseconds{delay->value};
    }
    return costs;
}

}  // namespace poll
