// Words for the counters of nodes and lines.
#include "cli/poll/StateText.h"

#include <fmt/format.h>

#include "cli/poll/LiveTable.h"

namespace cli {
namespace {

using std::chrono::nanoseconds;

/// Three digits are enough to compare two nodes.
std::string millisecondsText(nanoseconds time) {
    const double ms = std::chrono::duration<double, std::milli>(time).count();
    return ms < 100 ? fmt::format("{:.1f} ms", ms) : fmt::format("{:.0f} ms", ms);
}

std::string countText(const char* name, std::uint64_t count) {
    return count == 0 ? "" : fmt::format("  {} {}", name, count);
}

std::string exceptionsText(const poll::NodeState& node) {
    std::string text;
    for (std::size_t code = 0; code < node.exceptions.size(); ++code) {
        if (node.exceptions[code] == 0) continue;
        text += code == 0 ? fmt::format("  exceptions {}", node.exceptions[code])
                          : fmt::format("  exception {}: {}", code, node.exceptions[code]);
    }
    return text;
}

}  // namespace

std::string nodeText(const poll::NodeState& node) {
    std::string text = fmt::format("node {} {}", node.node, node.reachable ? "ok" : "silent");
    if (node.unreachable.count() > 0) text += fmt::format("  {} s lost", node.unreachable.count());
    if (node.replies > 0) {
        text += fmt::format("  p50 {}  p99 {}  max {}", millisecondsText(node.p50),
                            millisecondsText(node.p99), millisecondsText(node.max));
    }
    text += fmt::format("  requests {}  replies {}", node.requests, node.replies);
    text += countText("time-outs", node.timeouts);
    text += countText("check errors", node.checkErrors);
    text += exceptionsText(node);
    return text + countText("retries", node.retries);
}

std::string lineText(const poll::LineState& line) {
    std::string text = line.open            ? fmt::format("line {:.0f} % busy", line.load * 100)
                       : line.fault.empty() ? std::string("line closed")
                                            : "line closed: " + line.fault;
    if (line.cycle.count() > 0) text += "  cycle " + millisecondsText(line.cycle);
    return text + fmt::format("  cycles {}", line.cycles) + countText("late", line.lateCycles);
}

std::string statisticsText(const poll::Snapshot& snapshot) {
    std::string text;
    for (const poll::NodeState& node : snapshot.nodes)
        text += nodeText(node) + '\n';
    return text + lineText(snapshot.line) + '\n';
}

std::string ageText(std::chrono::milliseconds age) {
    using namespace std::chrono_literals;
    if (age < 0ms) age = 0ms;
    if (age < 10s) return fmt::format("{}.{}s", age / 1s, age % 1s / 100ms);
    if (age < 100s) return fmt::format("{}s", age / 1s);
    if (age < 100min) return fmt::format("{}m", age / 1min);
    if (age < 48h) return fmt::format("{}h", age / 1h);
    return fmt::format("{}d", age / 24h);
}

const char* qualityName(poll::Quality quality) {
    switch (quality) {
        case poll::Quality::Good:
            return "good";
        case poll::Quality::Stale:
            return "stale";
        case poll::Quality::Bad:
            return "bad";
        case poll::Quality::Never:
            break;
    }
    return "never";
}

}  // namespace cli
