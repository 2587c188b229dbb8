#include "poll/LineLedger.h"

namespace poll {

LineLedger::LineLedger(const LineSetup& setup, TimePoint now)
    : repeats_(setup.repeats), load_(now), cycles_(setup.blocks.size()) {
    for (const TagPlace& place : setup.places)
        nodes_.try_emplace(place.node, Node{false, NodeHealth(setup.patience), {}});
    for (const Block& block : setup.blocks)
        nodes_.at(block.node).isPolled = true;
}

LineLedger::Turn LineLedger::enter(const Transaction& transaction) {
    if (transaction.requests == 0) return Turn::None;
    const std::lock_guard lock(mutex_);
    load_.busy(transaction.from, transaction.to);
    Node& node = nodes_.at(transaction.node);
    const Failure& failure = transaction.failure;
    node.statistics.add(failure, transaction.requests, repeats_, transaction.to - transaction.from);
    if (!node.isPolled) return Turn::None;
    if (failure.heard() && node.health.succeeded(transaction.to)) return Turn::Returned;
    if (failure.againstNode() && node.health.failed(transaction.to)) return Turn::Lost;
    return Turn::None;
}

void LineLedger::blockDone(std::size_t block, std::chrono::nanoseconds taken) {
    const std::lock_guard lock(mutex_);
    cycles_.done(block, taken);
}

void LineLedger::blockSkipped(std::size_t block) {
    const std::lock_guard lock(mutex_);
    cycles_.skip(block);
}

void LineLedger::lateCycles(std::uint64_t altogether) {
    const std::lock_guard lock(mutex_);
    line_.lateCycles = altogether;
}

void LineLedger::opened() {
    const std::lock_guard lock(mutex_);
    line_.open = true;
    line_.fault.clear();
}

void LineLedger::closed(const std::string& fault, TimePoint now) {
    const std::lock_guard lock(mutex_);
    line_.open = false;
    line_.fault = fault;
    for (auto& [number, node] : nodes_)
        node.health.forget(now);
}

bool LineLedger::reachable(int node) const {
    const std::lock_guard lock(mutex_);
    return nodes_.at(node).health.reachable();
}

std::chrono::nanoseconds LineLedger::longestAnswer(int node) const {
    const std::lock_guard lock(mutex_);
    return nodes_.at(node).statistics.longestAnswer();
}

std::optional<std::pair<int, LineLedger::TimePoint>> LineLedger::nextProbe() const {
    const std::lock_guard lock(mutex_);
    std::optional<std::pair<int, TimePoint>> first;
    for (const auto& [number, node] : nodes_) {
        if (node.health.reachable()) continue;
        if (!first || node.health.probeAt() < first->second)
            first = {number, node.health.probeAt()};
    }
    return first;
}

std::vector<NodeState> LineLedger::nodes(TimePoint now) const {
    const std::lock_guard lock(mutex_);
    std::vector<NodeState> states;
    states.reserve(nodes_.size());
    for (const auto& [number, node] : nodes_) {
        NodeState& state = states.emplace_back();
        state.node = number;
        state.reachable = node.health.reachable();
        state.unreachable =
            std::chrono::duration_cast<std::chrono::seconds>(node.health.unreachableFor(now));
        node.statistics.fill(state);
    }
    return states;
}

LineState LineLedger::line(TimePoint now) const {
    const std::lock_guard lock(mutex_);
    LineState state = line_;
    state.load = load_.at(now);
    state.cycle = cycles_.cycle();
    state.cycles = cycles_.cycles();
    return state;
}

}  // namespace poll
