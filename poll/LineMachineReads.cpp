// What a line machine reads, and what it learns from it about block, node and port.
#include <algorithm>
#include <utility>

#include "poll/LineMachine.h"

namespace poll {

namespace {

// A device that has just come back may be slower than it was.
constexpr std::chrono::milliseconds kShortestProbe{50};

std::string nameOf(int node) {
    return "node " + std::to_string(node);
}

// One tag with a value is a block that was read: what the others lack is their own affair.
ReadError errorOf(const std::vector<TagReading>& readings) {
    for (const TagReading& reading : readings)
        if (reading.good) return {};
    return readings.empty() ? ReadError{-1, "Nothing was read"} : readings.front().error;
}

}  // namespace

bool LineMachine::work(TimePoint now) {
    if (probe(now)) return true;
    resumeFirst_ = !resumeFirst_;
    return resumeFirst_ ? resume() || begin(now) : begin(now) || resume();
}

// Asks an unreachable node once, when that has been due for longer than any block.
bool LineMachine::probe(TimePoint now) {
    const auto probe = ledger_.nextProbe();
    if (!probe || probe->second > now) return false;
    const auto due = schedule_.nextDue();
    if (due && *due < probe->second) return false;
    const std::size_t block = nodes_.at(probe->first).probe;
    const Block& part = setup_->blocks[block];
    const Outcome outcome = lookFor(part);
    if (outcome.failure.heard() && outcome.failure.kind != FailureKind::Refusal)
        keep(block, part, outcome);
    settle({part.node, part.requests, outcome.failure, outcome.from, outcome.to}, outcome.error);
    return true;
}

bool LineMachine::begin(TimePoint now) {
    while (const std::optional<std::size_t> block = schedule_.take(now)) {
        if (!isWorthIt(setup_->blocks[*block])) {
            schedule_.forgive();
            ledger_.blockSkipped(*block);
            continue;
        }
        ledger_.lateCycles(schedule_.lateCycles());
        if (blocks_[*block].refusals.busy()) continue;
        blocks_[*block].refusals.begin(now);
        blocks_[*block].taken = {};
        proceed(*block);
        return true;
    }
    return false;
}

// What the driver answers by itself does not depend on the node.
bool LineMachine::isWorthIt(const Block& block) const {
    return block.requests == 0 || ledger_.reachable(block.node);
}

bool LineMachine::resume() {
    while (!unfinished_.empty()) {
        const std::size_t block = unfinished_.front();
        unfinished_.pop_front();
        if (!blocks_[block].refusals.busy()) continue;
        proceed(block);
        return true;
    }
    return false;
}

void LineMachine::proceed(std::size_t block) {
    BlockWork& work = blocks_[block];
    const Block* part = work.refusals.next();
    if (part == nullptr) return ledger_.blockDone(block, work.taken);
    const Outcome outcome = read(*part);
    work.taken += outcome.to - outcome.from;
    const Transaction transaction{part->node, part->requests, outcome.failure, outcome.from,
                                  outcome.to};
    judge(block, *part, outcome);
    if (work.refusals.busy())
        unfinished_.push_back(block);
    else
        ledger_.blockDone(block, work.taken);
    settle(transaction, outcome.error);
}

LineMachine::Outcome LineMachine::read(const Block& part) {
    return timed([&] { return source_->read(part); });
}

// A node that has answered before is not waited for much longer than it ever took.
LineMachine::Outcome LineMachine::lookFor(const Block& part) {
    const auto longest =
        std::chrono::ceil<std::chrono::milliseconds>(ledger_.longestAnswer(part.node));
    const auto wait = longest.count() > 0 ? std::max(2 * longest, kShortestProbe) : longest;
    return timed([&] { return source_->probe(part, wait); });
}

template <class Reading>
LineMachine::Outcome LineMachine::timed(Reading&& reading) {
    Outcome outcome;
    outcome.from = clock_.now();
    outcome.readings = reading();
    outcome.to = clock_.now();
    outcome.error = errorOf(outcome.readings);
    outcome.failure = classify(outcome.error);
    return outcome;
}

void LineMachine::judge(std::size_t block, const Block& part, const Outcome& outcome) {
    const FailureKind kind = outcome.failure.kind;
    if (kind == FailureKind::Refusal) {
        if (refuse(block, part, outcome)) keep(block, part, outcome);
        return;
    }
    keep(block, part, outcome);
    if (kind == FailureKind::None || kind == FailureKind::Value)
        accept(block, part);
    else
        blocks_[block].refusals.failed();
}

void LineMachine::accept(std::size_t block, const Block& part) {
    Refusals& refusals = blocks_[block].refusals;
    if (refusals.isSplit())
        for (const std::size_t tag : part.tags)
            watch_.fine(setup_->tagNames[tag]);
    refusals.accepted();
}

/// @return whether that is the answer of this round for all tags of the part.
bool LineMachine::refuse(std::size_t block, const Block& part, const Outcome& outcome) {
    const std::size_t tag = part.tags.front();
    const Refusals::Verdict verdict = blocks_[block].refusals.refused(outcome.to);
    if (verdict == Refusals::Verdict::Hole) watch_.fault(setup_->tagNames[tag], outcome.error.text);
    return verdict != Refusals::Verdict::Parts;
}

void LineMachine::keep(std::size_t block, const Block& part, const Outcome& outcome) {
    values_.take(block, part.tags, outcome.readings, !outcome.failure.againstNode(), clock_.wall());
}

// --- What a transaction means for its node and for the line ---

void LineMachine::settle(const Transaction& transaction, const ReadError& error) {
    const Failure& failure = transaction.failure;
    const LineLedger::Turn turn = ledger_.enter(transaction);
    if (turn == LineLedger::Turn::Lost) loseNode(transaction.node, error);
    if (turn == LineLedger::Turn::Returned) welcomeNode(transaction.node);
    watchNode(transaction.node, failure, error);
    if (!failure.heard() && source_->gone()) loseLine("The port is gone");
}

void LineMachine::watchNode(int node, const Failure& failure, const ReadError& error) {
    const auto found = nodes_.find(node);
    if (found == nodes_.end()) return;
    NodeWork& work = found->second;
    if (failure.againstNode() && !ledger_.reachable(node)) {
        watch_.fault(nameOf(node), error.text);
        work.isFaulty = true;
    } else if (failure.heard() && work.isFaulty) {
        watch_.fine(nameOf(node));
        work.isFaulty = false;
    }
}

void LineMachine::loseNode(int node, const ReadError& error) {
    for (const std::size_t block : nodes_.at(node).blocks) {
        blocks_[block].refusals.stop();
        values_.lose(block, error, clock_.wall());
        ledger_.blockSkipped(block);
    }
}

void LineMachine::welcomeNode(int node) {
    const std::vector<std::size_t>& blocks = nodes_.at(node).blocks;
    for (const std::size_t block : blocks)
        blocks_[block].refusals.retrySoon();
    schedule_.restart(blocks, clock_.now());
}

}  // namespace poll
