#include "poll/CostModel.h"

namespace poll {
namespace {

using std::chrono::nanoseconds;

wire::TransactionLength readLength(wire::Mode mode, long items, int itemBytes) {
    const wire::Form form = itemBytes == 0 ? wire::Form::ReadBits : wire::Form::ReadWords;
    return wire::transactionLength(mode, form, static_cast<std::size_t>(items),
                                   static_cast<std::size_t>(itemBytes));
}

nanoseconds ofNode(const std::map<int, nanoseconds>& times, int node, nanoseconds otherwise) {
    const auto found = times.find(node);
    return found == times.end() ? otherwise : found->second;
}

}  // namespace

ReadCost CostModel::readCost(int node, int itemBytes) const {
    const wire::Pauses pauses{.before = ofNode(delays, node, nanoseconds{0}),
                              .turnaround = ofNode(turnarounds, node, turnaround),
                              .after = gapAfterReply};
    const auto timeOf = [&](long items) {
        return wire::transactionTime(mode, rate, readLength(mode, items, itemBytes), pauses);
    };
    const long unit = itemBytes == 0 ? 8 : 1;
    return {.request = timeOf(0), .unit = timeOf(unit) - timeOf(0), .itemsInUnit = unit};
}

std::size_t CostModel::readCharacters(long items, int itemBytes) const {
    return readLength(mode, items, itemBytes).characters();
}

}  // namespace poll
