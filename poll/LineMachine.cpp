#include "poll/LineMachine.h"

#include <algorithm>
#include <utility>

namespace poll {

namespace {

const char* const kPort = "port";

std::vector<Schedule::Duration> periodsOf(const std::vector<Block>& blocks) {
    std::vector<Schedule::Duration> periods;
    periods.reserve(blocks.size());
    for (const Block& block : blocks)
        periods.emplace_back(block.period);
    return periods;
}

}  // namespace

LineMachine::LineMachine(std::shared_ptr<const LineSetup> setup,
                         std::unique_ptr<BlockSource> source, Clock& clock, FaultReport report)
    : setup_(std::move(setup)),
      source_(std::move(source)),
      clock_(clock),
      values_(setup_->places.size(), setup_->blocks),
      ledger_(*setup_, clock.now()),
      watch_(setup_->name, std::move(report)),
      schedule_(periodsOf(setup_->blocks), clock.now()) {
    blocks_.reserve(setup_->blocks.size());
    for (const Block& block : setup_->blocks)
        addBlock(block);
}

void LineMachine::addBlock(const Block& block) {
    const std::size_t index = blocks_.size();
    blocks_.push_back({Refusals(block, setup_->places, setup_->patience.holeRetry)});
    if (block.requests == 0) return;
    NodeWork& node = nodes_[block.node];
    if (node.blocks.empty() || block.cost < setup_->blocks[node.probe].cost) node.probe = index;
    node.blocks.push_back(index);
}

Snapshot LineMachine::snapshot() const {
    const TimePoint now = clock_.now();
    return {values_.tags(), ledger_.nodes(now), ledger_.line(now)};
}

LineMachine::TimePoint LineMachine::step() {
    const TimePoint now = clock_.now();
    if (!isOpen_ && now >= reopenAt_) return open(now) ? now : reopenAt_;
    if (!isOpen_) {
        writes_.refuseAll({-1, watch_.of(kPort)});
        return reopenAt_;
    }
    if (std::optional<PendingWrite> write = writes_.take())
        doWrite(std::move(*write));
    else if (!work(now))
        return nextMoment(now);
    return isOpen_ ? clock_.now() : reopenAt_;
}

LineMachine::TimePoint LineMachine::nextMoment(TimePoint now) const {
    if (!unfinished_.empty()) return now;
    TimePoint next = schedule_.nextDue().value_or(now + std::chrono::hours{1});
    if (const auto probe = ledger_.nextProbe()) next = std::min(next, probe->second);
    return next;
}

void LineMachine::close() {
    if (isOpen_) source_->close();
    isOpen_ = false;
    ledger_.closed("stopped", clock_.now());
    writes_.close();
}

// --- The port ---

bool LineMachine::open(TimePoint now) {
    if (!source_->open()) {
        const std::string reason = source_->fault();
        loseLine(reason.empty() ? "The port can't be opened" : reason);
        return false;
    }
    isOpen_ = true;
    ledger_.opened();
    schedule_.restartAll(now);
    for (BlockWork& block : blocks_)
        block.refusals.retrySoon();
    watch_.fine(kPort);
    return true;
}

void LineMachine::loseLine(const std::string& fault) {
    if (isOpen_) source_->close();
    isOpen_ = false;
    const TimePoint now = clock_.now();
    reopenAt_ = now + setup_->patience.reopen;
    ledger_.closed(fault, now);
    unfinished_.clear();
    const ReadError error{-1, fault};
    for (std::size_t block = 0; block < blocks_.size(); ++block) {
        blocks_[block].refusals.stop();
        values_.lose(block, error, clock_.wall());
    }
    writes_.refuseAll(error);
    watch_.fault(kPort, fault);
}

// --- Writes ---

void LineMachine::doWrite(PendingWrite write) {
    write.done.set_value(send(write));
}

WriteOutcome LineMachine::send(const PendingWrite& write) {
    if (write.tag >= setup_->places.size()) return ReadError{-1, "No such tag"};
    const TimePoint from = clock_.now();
    WriteOutcome outcome = source_->write(write.tag, write.value);
    const ReadError error = outcome.value_or(ReadError{});
    settle({setup_->places[write.tag].node, 1, classify(error), from, clock_.now()}, error);
    return outcome;
}

}  // namespace poll
