// The sub-command `mrtu sim`.
#include <fmt/format.h>
#include <signal.h>

#include <array>
#include <atomic>
#include <iterator>
#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/EndSignals.h"
#include "cli/SimBehaviour.h"
#include "cli/SimNodes.h"
#include "cli/Validators.h"
#include "sim/Simulator.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(Prints the device to open and serves it until Ctrl-C. docs/simulator.md tells what the nodes hold.

Examples:
  mrtu sim
  mrtu sim --ascii --node 1 --node 17 --link /tmp/line --trace
  mrtu sim --fault exception=2,times=3
  mrtu sim --baud 9600 --turnaround 20..60 --dead 7 --refuse 1:HREG:100-199)";

struct SimOptions {
    bool ascii = false;
    bool plain = false;
    bool trace = false;
    std::vector<int> nodes;
    std::string link;
    std::vector<std::string> faults;
    SimBehaviour behaviour;
};

std::atomic<sim::Simulator*> g_serving{nullptr};

extern "C" void endServing(int) {
    if (sim::Simulator* const simulator = g_serving.load()) simulator->requestStop();
}

/// Lets the end signals stop the simulator while this object lives: it takes its link away, and the
/// command has done what it was asked for.
class StopOnSignal {
  public:
    explicit StopOnSignal(sim::Simulator& simulator) {
        g_serving.store(&simulator);
        struct sigaction action {};
        action.sa_handler = endServing;
        for (std::size_t i = 0; i < std::size(kEndSignals); ++i) {
            taken_[i] = !isIgnored(kEndSignals[i]);
            if (taken_[i]) sigaction(kEndSignals[i], &action, &old_[i]);
        }
    }
    ~StopOnSignal() {
        for (std::size_t i = 0; i < std::size(kEndSignals); ++i) {
            if (taken_[i]) sigaction(kEndSignals[i], &old_[i], nullptr);
        }
        g_serving.store(nullptr);
    }
    StopOnSignal(const StopOnSignal&) = delete;
    StopOnSignal& operator=(const StopOnSignal&) = delete;

  private:
    std::array<struct sigaction, std::size(kEndSignals)> old_{};
    std::array<bool, std::size(kEndSignals)> taken_{};
};

std::vector<sim::NodeOptions> nodesOf(const SimOptions& options) {
    std::vector<sim::NodeOptions> nodes = defaultSimNodes(options.plain);
    if (options.nodes.empty()) return nodes;
    const sim::NodeOptions pattern = nodes.front();
    nodes.clear();
    for (const int address : options.nodes) {
        nodes.push_back(pattern);
        nodes.back().address = static_cast<std::uint8_t>(address);
    }
    return nodes;
}

std::unique_ptr<sim::Simulator> makeSimulator(CommandContext& context, const SimOptions& options) {
    sim::SimulatorOptions simOptions;
    simOptions.mode = options.ascii ? wire::Mode::Ascii : wire::Mode::Rtu;
    simOptions.nodes = nodesOf(options);
    simOptions.link = options.link;
    applySimBehaviour(options.behaviour, simOptions);
    if (options.trace) {
        simOptions.trace = [&err = context.err, mode = simOptions.mode](const sim::LineEvent& e) {
            err << sim::describe(e, mode) << std::endl;
        };
    }
    try {
        return std::make_unique<sim::Simulator>(std::move(simOptions));
    } catch (const std::invalid_argument& error) {
        throw CommandError(ExitCode::Usage, error.what());
    }
}

void addFaults(sim::Simulator& simulator, const std::vector<std::string>& faults) {
    for (const std::string& text : faults) {
        std::string error;
        const auto fault = sim::parseFault(text, error);
        if (!fault) throw CommandError(ExitCode::Usage, fmt::format("--fault {}: {}", text, error));
        simulator.faults().add(*fault);
    }
}

void announce(std::ostream& out, const sim::Simulator& simulator, const SimOptions& options) {
    const int node = options.nodes.empty() ? 1 : options.nodes.front();
    out << fmt::format("simulated {} line: {}\n", options.ascii ? "ASCII" : "RTU",
                       simulator.path());
    const int baud = options.behaviour.baud;
    out << fmt::format("try: mrtu read --port {}{}{} '{}?HREG?400001?unsignedShort'\n",
                       simulator.path(), options.ascii ? " --ascii" : "",
                       baud == 0 ? "" : fmt::format(" --baud {}", baud), node);
    out << "Ctrl-C ends it." << std::endl;
}

void serve(CommandContext& context, const SimOptions& options) {
    const auto simulator = makeSimulator(context, options);
    addFaults(*simulator, options.faults);
    const StopOnSignal stopOnSignal(*simulator);
    try {
        simulator->start();
    } catch (const std::system_error& error) {
        throw CommandError(ExitCode::Port, error.what());
    }
    announce(context.out, *simulator, options);
    if (simulator->wait() == sim::Simulator::End::HungUp) {
        throw CommandError(ExitCode::Port, "the line hung up");
    }
}

}  // namespace

CommandSpec simCommand(CommandContext& context) {
    const auto options = std::make_shared<SimOptions>();
    CommandSpec command{.name = "sim", .summary = "Serve a simulated line", .footer = kFooter};
    command.options = {
        {.names = "--ascii", .target = &options->ascii, .help = "ASCII frames instead of RTU"},
        {.names = "--node",
         .target = &options->nodes,
         .help = "A node of the line; default is 1 to 10",
         .valueName = "N",
         .range = NumberRange{1, kHighestNode},
         .oneWordEach = true},
        {.names = "--plain", .target = &options->plain, .help = "Nodes without 32-bit registers"},
        {.names = "--link",
         .target = &options->link,
         .help = "Symbolic link to the device",
         .valueName = "PATH",
         .check = notEmpty()},
        {.names = "--fault",
         .target = &options->faults,
         .help = "What goes wrong with the next answers",
         .valueName = "TEXT",
         .oneWordEach = true},
        {.names = "--trace",
         .target = &options->trace,
         .help = "Show every frame on standard error"},
    };
    addSimBehaviour(command, options->behaviour);
    command.action = [options, &context] { serve(context, *options); };
    return command;
}

}  // namespace cli
