// How slow and how unreliable a simulated line is.
#include "cli/SimBehaviour.h"

#include <fmt/format.h>

#include <algorithm>
#include <limits>
#include <optional>

#include "cli/ExitCode.h"
#include "cli/SimNodes.h"
#include "sim/NodeText.h"

namespace cli {
namespace {

using sim::NodeOptions;
using Nodes = std::vector<NodeOptions>;

constexpr int kSlowestBaud = 50;
/// The fastest that Linux has a name for.
constexpr int kFastestBaud = 4000000;

[[noreturn]] void refuse(const char* option, const std::string& text, const std::string& why) {
    throw CommandError(ExitCode::Usage, fmt::format("{} {}: {}", option, text, why));
}

/// Changes one node, or all where none is meant.
template <typename Change>
void forNodes(Nodes& nodes, std::optional<std::uint8_t> meant, Change change) {
    for (NodeOptions& node : nodes)
        if (!meant || *meant == node.address) change(node);
}

bool hasNode(const Nodes& nodes, int address) {
    return std::any_of(nodes.begin(), nodes.end(),
                       [address](const NodeOptions& node) { return node.address == address; });
}

/// Applies every text, those without a node first.
template <typename Parse, typename Apply>
void applyTexts(const char* option, const std::vector<std::string>& texts, Parse parse,
                Nodes& nodes, Apply apply) {
    for (const bool forOne : {false, true}) {
        for (const std::string& text : texts) {
            std::string error;
            const auto read = parse(text, error);
            if (!read) refuse(option, text, error);
            if (read->node && !hasNode(nodes, *read->node))
                refuse(option, text, fmt::format("node {} is not on the line", *read->node));
            if (read->node.has_value() != forOne) continue;
            forNodes(nodes, read->node, [&](NodeOptions& node) { apply(node, read->behaviour); });
        }
    }
}

void applyDead(const std::vector<int>& dead, Nodes& nodes) {
    for (const int address : dead) {
        if (!hasNode(nodes, address))
            refuse("--dead", std::to_string(address), "the node is not on the line");
        forNodes(nodes, static_cast<std::uint8_t>(address),
                 [](NodeOptions& node) { node.presence = sim::kDead; });
    }
}

/// Start and data bits, parity and stop bits. What is not said is as in the driver's default: 8
/// bits, no parity, 1 stop bit.
int characterBitsOf(const SimBehaviour& behaviour) {
    const int data = behaviour.bits == "7" ? 7 : 8;
    const int parity = behaviour.parity.empty() || behaviour.parity == "none" ? 0 : 1;
    const int stop = behaviour.stopBits == "2" ? 2 : 1;
    return 1 + data + parity + stop;
}

wire::LineRate rateOf(const SimBehaviour& behaviour) {
    const bool hasParts =
        !behaviour.parity.empty() || !behaviour.stopBits.empty() || !behaviour.bits.empty();
    if (hasParts && behaviour.baud == 0) {
        throw CommandError(ExitCode::Usage,
                           "--parity, --stopbits and --bits say how long a character takes at "
                           "--baud, which is missing");
    }
    return {.baud = behaviour.baud, .characterBits = characterBitsOf(behaviour)};
}

std::vector<OptionSpec> lineOptions(SimBehaviour& behaviour) {
    return {
        {.names = "--baud",
         .target = &behaviour.baud,
         .help = "Characters take their time at this rate, and a silence of 3.5 stands before each "
                 "RTU reply. Default: everything at once",
         .valueName = "N",
         .range = NumberRange{kSlowestBaud, kFastestBaud}},
        {.names = "--parity",
         .target = &behaviour.parity,
         .help = "Whether a character has a parity bit: none|even|odd|mark, default none",
         .choices = {"none", "even", "odd", "mark"}},
        {.names = "--stopbits",
         .target = &behaviour.stopBits,
         .help = "Stop bits of a character: 1|2, default 1",
         .choices = {"1", "2"}},
        {.names = "--bits",
         .target = &behaviour.bits,
         .help = "Data bits of a character: 7|8, default 8",
         .choices = {"7", "8"}},
    };
}

std::vector<OptionSpec> nodeOptions(SimBehaviour& behaviour) {
    return {
        {.names = "--turnaround",
         .target = &behaviour.turnarounds,
         .help = "Time in ms before a reply: 20, 20..60 (any between), 20+5 (5 more each time), "
                 "20+5..200 (at most 200), 3:20 (node 3 only). Can be repeated",
         .valueName = "[NODE:]TIME",
         .oneWordEach = true},
        {.names = "--seed",
         .target = &behaviour.seed,
         .help = "Of the turnarounds that are any between two; default 1",
         .valueName = "N",
         .range = NumberRange{0, std::numeric_limits<int>::max()}},
        {.names = "--no-queue",
         .target = &behaviour.noQueue,
         .help = "A busy node loses requests instead of answering them in turn"},
        {.names = "--dead",
         .target = &behaviour.dead,
         .help = "A node that never answers. Can be repeated",
         .valueName = "NODE",
         .range = NumberRange{1, kHighestNode},
         .oneWordEach = true},
        {.names = "--away",
         .target = &behaviour.away,
         .help = "Nodes come and go: 10/5 is 10 s there, then 5 s away, and so on; 3:10/5 node 3 "
                 "only. Can be repeated",
         .valueName = "[NODE:]THERE/AWAY",
         .oneWordEach = true},
        {.names = "--refuse",
         .target = &behaviour.refused,
         .help = "Exception 2 for a range of OUTP, INP, HREG or IREG, addresses from 0: "
                 "HREG:100-199, 3:HREG:7 (node 3 only). Can be repeated",
         .valueName = "[NODE:]AREA:FIRST[-LAST]",
         .oneWordEach = true},
    };
}

}  // namespace

void addSimBehaviour(CommandSpec& command, SimBehaviour& behaviour) {
    command.addGroup("Line", lineOptions(behaviour));
    command.addGroup("Nodes", nodeOptions(behaviour));
}

void applySimBehaviour(const SimBehaviour& behaviour, sim::SimulatorOptions& line) {
    line.rate = rateOf(behaviour);
    line.losesWhileBusy = behaviour.noQueue;
    line.seed = static_cast<std::uint64_t>(behaviour.seed);
    applyTexts("--turnaround", behaviour.turnarounds, sim::parseTurnaround, line.nodes,
               [](NodeOptions& node, const sim::Turnaround& time) { node.turnaround = time; });
    applyTexts("--away", behaviour.away, sim::parsePresence, line.nodes,
               [](NodeOptions& node, const sim::Presence& time) { node.presence = time; });
    applyTexts(
        "--refuse", behaviour.refused, sim::parseRefusedRange, line.nodes,
        [](NodeOptions& node, const sim::RefusedRange& range) { node.refused.push_back(range); });
    applyDead(behaviour.dead, line.nodes);
}

}  // namespace cli
