#include "sim/Turns.h"

#include <algorithm>
#include <utility>

namespace sim {

void Turns::add(Request request) {
    waiting_.push_back(std::move(request));
}

std::optional<Request> Turns::begin() {
    const auto due = std::find_if(waiting_.begin(), waiting_.end(), [this](const Request& each) {
        return !nodes_[each.node()].busy;
    });
    if (due == waiting_.end()) return std::nullopt;
    Request request = std::move(*due);
    waiting_.erase(due);
    Node& node = nodes_[request.node()];
    node.busy = true;
    request.at = std::max(request.at, node.freeSince);
    return request;
}

void Turns::end(std::uint8_t node, Instant at) {
    nodes_[node] = {.busy = false, .freeSince = at};
}

bool Turns::busyAt(std::uint8_t node, Instant at) const {
    return nodes_[node].busy || at < nodes_[node].freeSince;
}

}  // namespace sim
