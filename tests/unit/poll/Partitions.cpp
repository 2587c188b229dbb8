#include "tests/unit/poll/Partitions.h"

#include <algorithm>
#include <limits>

namespace poll {
namespace {

long endOf(const TagPlace& place) {
    return place.first + place.items;
}

std::chrono::nanoseconds timeOf(const TagPlace& kind, long items, const CostModel& costs) {
    const wire::Form form = kind.bits ? wire::Form::ReadBits : wire::Form::ReadWords;
    const auto length = wire::transactionLength(costs.mode, form, static_cast<std::size_t>(items),
                                                static_cast<std::size_t>(kind.itemBytes));
    return wire::transactionTime(costs.mode, costs.rate, length,
                                 {.turnaround = costs.turnaround, .after = costs.gapAfterReply});
}

bool isCut(const TagPlace& place, long first, long most) {
    return (place.first - first) / most != (endOf(place) - 1 - first) / most;
}

void extend(std::size_t next, std::size_t count, Grouping& grouping,
            const std::function<void(const Grouping&)>& visit) {
    if (next == count) {
        visit(grouping);
        return;
    }
    for (std::size_t at = 0; at < grouping.size(); ++at) {
        grouping[at].push_back(next);
        extend(next + 1, count, grouping, visit);
        grouping[at].pop_back();
    }
    grouping.push_back({next});
    extend(next + 1, count, grouping, visit);
    grouping.pop_back();
}

}  // namespace

void forEachGrouping(std::size_t count, const std::function<void(const Grouping&)>& visit) {
    Grouping grouping;
    extend(0, count, grouping, visit);
}

std::optional<double> loadOfGroup(std::span<const TagPlace> places, const Group& group, long most,
                                  const CostModel& costs) {
    long first = std::numeric_limits<long>::max();
    long end = 0;
    auto period = std::chrono::milliseconds::max();
    for (const std::size_t at : group) {
        first = std::min(first, places[at].first);
        end = std::max(end, endOf(places[at]));
        period = std::min(period, places[at].period);
    }
    if (end - first > most) {
        bool isOneTag = false;
        for (const std::size_t at : group) {
            isOneTag |= places[at].first == first && endOf(places[at]) == end;
            if (places[at].items <= most && isCut(places[at], first, most)) return std::nullopt;
        }
        if (!isOneTag) return std::nullopt;
    }
    std::chrono::nanoseconds time{0};
    for (long at = first; at < end; at += most)
        time += timeOf(places[group.front()], std::min(most, end - at), costs);
    return std::chrono::duration<double>(time) / std::chrono::duration<double>(period);
}

double leastLoad(std::span<const TagPlace> places, long most, const CostModel& costs) {
    double least = std::numeric_limits<double>::max();
    forEachGrouping(places.size(), [&](const Grouping& grouping) {
        double sum = 0;
        for (const Group& group : grouping) {
            const auto load = loadOfGroup(places, group, most, costs);
            sum += load.value_or(std::numeric_limits<double>::infinity());
            if (sum >= least) return;
        }
        least = sum;
    });
    return least;
}

}  // namespace poll
