// How a session is put together: driver, line, storage, trace.
#include "cli/Session.h"

#include <fmt/format.h>

#include <ostream>
#include <system_error>

#include "cli/ConfigWarnings.h"
#include "cli/SimNodes.h"
#include "cli/TraceText.h"
#include "runtime/ModbusReplies.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"
#include "runtime/TracingSerialFactory.h"
#include "settings/ConfigText.h"

namespace cli {
namespace {

using runtime::PluginError;

/// Hands on a value or ends the command with the error's text.
template <class Value, class Error>
Value valueOr(runtime::Result<Value, Error> result, ExitCode code) {
    if (!result) throw CommandError(code, result.error().text);
    return std::move(result).value();
}

bool isAscii(const std::string& configText) {
    return settings::itemOf(configText, "txMode") == "ASCII";
}

std::unique_ptr<sim::Simulator> makeSimulator(const LineOptions& options,
                                              const std::string& configText) {
    if (!options.sim) return nullptr;
    sim::SimulatorOptions simOptions;
    simOptions.mode = isAscii(configText) ? wire::Mode::Ascii : wire::Mode::Rtu;
    simOptions.nodes = simNodesFor(configText);
    return std::make_unique<sim::Simulator>(std::move(simOptions));
}

/// Notes a vanished port and, where it is wanted, shows the frames.
runtime::TracingSerialFactory::Callback watcher(bool& portGone, std::ostream& err,
                                                const LineOptions& options, bool ascii) {
    const auto text = std::make_shared<TraceText>(
        TraceStyle{.ascii = ascii, .hex = options.traceHex, .meaning = options.traceMeaning});
    const bool shown = options.trace || options.traceHex || options.traceMeaning;
    return [&portGone, &err, text, shown](const runtime::TraceEvent& event) {
        if (!event.complete) portGone = true;
        if (shown) err << text->lineOf(event) << '\n';
    };
}

runtime::FrameEndBy frameEndOf(const LineOptions& options) {
    return options.frameEnd == "length" ? runtime::FrameEndBy::Length
                                        : runtime::FrameEndBy::Silence;
}

runtime::Module bindModule(const std::string& plugin, IInterfaceFactory& host) {
    const auto library = valueOr(runtime::PluginLibrary::load(plugin), ExitCode::Other);
    return valueOr(runtime::Module::bind(library, host), ExitCode::Other);
}

}  // namespace

/// The host of the drivers, in the order of its making. A plug-in has one host in a process, so
/// sessions that live at the same time share it.
struct Session::Host {
    Host(CommandContext& of, const LineOptions& options, const std::string& configText,
         StorageNeed need)
        : context(of),
          ports(portsOf(options, configText)),
          plugin(pluginFile(context)),
          storage(openOverrides(context, options, need)),
          simulator(makeSimulator(options, configText)),
          watch(watcher(portGone, context.err, options, isAscii(configText))),
          tracing(serial, watch),
          services(multiTask, tracing, storage.get()),
          module(bindModule(plugin, services)) {
        serial.setGapFloor(options.minGapMs);
        serial.setFrameEnd(frameEndOf(options));
        serial.setReplyRules(std::make_shared<runtime::ModbusReplies>());
        serial.setThrownAway([this](const std::string& port, runtime::ByteView frame) {
            watch({runtime::TraceDirection::Received, port, std::chrono::steady_clock::now(),
                   std::chrono::system_clock::now(), frame, true, true});
        });
        serial.setReport([this](const std::string& text) { complain(context, text); });
        for (const PortMapping& port : ports)
            mapPort(port);
    }

    void mapPort(const PortMapping& port) {
        if (!serial.mapPort(port.name, port.device)) {
            throw CommandError(ExitCode::Usage, "--port: " + serial.lastError());
        }
    }

    void startSimulator() {
        if (simulated) return;
        try {
            simulator->start();
        } catch (const std::system_error& error) {
            throw CommandError(ExitCode::Port, fmt::format("simulated line: {}", error.what()));
        }
        simulated = true;
    }

    CommandContext& context;
    std::vector<PortMapping> ports;
    std::string plugin;
    std::unique_ptr<runtime::Storage> storage;
    std::unique_ptr<sim::Simulator> simulator;
    bool simulated = false;
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    bool portGone = false;
    runtime::TracingSerialFactory::Callback watch;
    runtime::TracingSerialFactory tracing;
    runtime::ServiceFactory services;
    runtime::Module module;
};

/// The driver goes before its host.
struct Session::Parts {
    CommandContext& context;
    std::string configText;
    std::shared_ptr<Host> host;
    runtime::Channel channel;
    bool prepared = false;
};

Session::Session(CommandContext& context, const LineOptions& options, StorageNeed need)
    : Session(context, options, configTextOf(options), need, nullptr) {}

Session::Session(CommandContext& context, const LineOptions& options, const Session& beside)
    : Session(context, options, configTextOf(options), StorageNeed::Use, beside.parts_->host) {}

Session::Session(CommandContext& context, const LineOptions& options, std::string configText,
                 StorageNeed need, std::shared_ptr<Host> host) {
    if (!host) host = std::make_shared<Host>(context, options, configText, need);
    runtime::ProtocolObject protocol =
        valueOr(host->module.createProtocol(options.protocol), ExitCode::Other);
    parts_.reset(new Parts{context, std::move(configText), std::move(host),
                           runtime::Channel(std::move(protocol))});
    if (!options.ident.empty()) parts_->channel.setIdent(options.ident);
    warnOfUnknownKeys(context, parts_->channel.protocol(), parts_->configText);
    if (const auto done = parts_->channel.configure(parts_->configText); !done) {
        throw CommandError(ExitCode::Usage, "configuration: " + done.error().text);
    }
}

Session::~Session() = default;

bool Session::portGone() const {
    return parts_->host->portGone || parts_->host->serial.portGone();
}

std::uint64_t Session::framesSent() const {
    return parts_->host->tracing.counts().framesSent;
}

bool Session::portVanished() const {
    return parts_->host->serial.portGone();
}

std::string Session::portFault() const {
    return parts_->host->serial.lastError();
}

void Session::limitWait(std::chrono::milliseconds wait) {
    parts_->host->serial.limitWait(static_cast<int>(wait.count()));
}

void Session::prepareLine() {
    if (parts_->prepared) return;
    if (!hasLine()) {
        throw CommandError(ExitCode::Usage, "no line: --port com1=/dev/ttyUSB0, or --sim");
    }
    if (parts_->host->simulator) {
        parts_->host->startSimulator();
        parts_->host->mapPort({settings::itemOf(parts_->configText, "uart").value_or("com1"),
                               parts_->host->simulator->path()});
    }
    if (parts_->host->storage) {
        reportUnused(parts_->context, *parts_->host->storage,
                     parts_->channel.protocol().GetIdent());
    }
    parts_->prepared = true;
}

void Session::start() {
    prepareLine();
    if (const auto done = parts_->channel.start(); !done) {
        const std::string reason = parts_->host->serial.lastError();
        throw CommandError(ExitCode::Port,
                           reason.empty() ? done.error().text : done.error().text + ": " + reason);
    }
    // Without its overrides a request might reach another device than it is meant for.
    checkStorage();
}

bool Session::hasLine() const {
    return parts_->host->simulator != nullptr || !parts_->host->ports.empty();
}

runtime::Channel& Session::channel() const {
    return parts_->channel;
}

runtime::Storage* Session::storage() {
    return parts_->host->storage.get();
}

void Session::checkStorage() {
    if (parts_->host->storage && parts_->host->storage->failed()) {
        throw CommandError(ExitCode::Other, "storage: " + parts_->host->storage->lastError());
    }
}

const std::string& Session::configText() const {
    return parts_->configText;
}

}  // namespace cli
