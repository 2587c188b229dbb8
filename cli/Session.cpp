#include "cli/Session.h"

#include <fmt/format.h>

#include <algorithm>
#include <ostream>
#include <system_error>

#include "cli/ByteOrder.h"
#include "cli/ConfigText.h"
#include "cli/ConfigWarnings.h"
#include "cli/SimNodes.h"
#include "cli/TraceText.h"
#include "cli/ValueTypes.h"
#include "runtime/HostServices.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/TracingSerialFactory.h"

namespace cli {
namespace {

using runtime::PluginError;

// Codes of IProtocol::GetLastError().
constexpr int kGeneralError = -1;
constexpr int kConversionError = -9;
constexpr int kNodeRefused = -10;

/// An address of one byte; this one takes a node off the line.
constexpr int kLargestAddress = 255;

/// No area holds a longer value; the driver refuses such a tag when it is used.
constexpr std::size_t kLongestValue = std::size_t{4} * 65536;

/// Zeroes are a value that every conversion takes which can be applied to the type at all.
bool conversionsApply(const ITag& tag) {
    const std::size_t length = shapeOf(tag).bytes;
    if (length == 0 || length > kLongestValue) return true;
    const auto packed = static_cast<std::size_t>(std::max(0, tag.PackedLen()));
    const Bytes zeroes(std::max(length, packed));
    Bytes value(length);
    return tag.ConvertVariable(zeroes.data(), value.data(), false);
}

/// Hands on a value or ends the command with the error's text.
template <class Value, class Error>
Value valueOr(runtime::Result<Value, Error> result, ExitCode code) {
    if (!result) throw CommandError(code, result.error().text);
    return std::move(result).value();
}

bool isAscii(const std::string& configText) {
    return itemOf(configText, "txMode") == "ASCII";
}

std::unique_ptr<sim::Simulator> makeSimulator(const LineOptions& options,
                                              const std::string& configText) {
    if (!options.sim) return nullptr;
    sim::SimulatorOptions simOptions;
    simOptions.mode = isAscii(configText) ? sim::Mode::ascii : sim::Mode::rtu;
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

runtime::ProtocolObject makeProtocol(const std::string& plugin, IInterfaceFactory& host,
                                     const std::string& name) {
    const auto library = valueOr(runtime::PluginLibrary::load(plugin), ExitCode::Other);
    const auto module = valueOr(runtime::Module::bind(library, host), ExitCode::Other);
    return valueOr(module.createProtocol(name), ExitCode::Other);
}

}  // namespace

/// In the order of their making; the driver, last, goes first.
struct Session::Parts {
    Parts(CommandContext& of, const LineOptions& options, StorageNeed need)
        : context(of),
          configText(configTextOf(options)),
          ports(portsOf(options, configText)),
          plugin(pluginFile(context)),
          storage(openOverrides(context, options, need)),
          simulator(makeSimulator(options, configText)),
          tracing(serial, watcher(portGone, context.err, options, isAscii(configText))),
          host(multiTask, tracing, storage.get()),
          channel(makeProtocol(plugin, host, options.protocol)) {
        serial.setGapFloor(options.minGapMs);
        for (const PortMapping& port : ports)
            mapPort(port);
    }

    void mapPort(const PortMapping& port) {
        if (!serial.mapPort(port.name, port.device)) {
            throw CommandError(ExitCode::Usage, "--port: " + serial.lastError());
        }
    }

    CommandContext& context;
    std::string configText;
    std::vector<PortMapping> ports;
    std::string plugin;
    std::unique_ptr<runtime::Storage> storage;
    std::unique_ptr<sim::Simulator> simulator;
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    bool portGone = false;
    runtime::TracingSerialFactory tracing;
    runtime::HostServices host;
    runtime::Channel channel;
};

Session::Session(CommandContext& context, const LineOptions& options, StorageNeed need)
    : parts_(std::make_unique<Parts>(context, options, need)) {
    if (!options.ident.empty()) parts_->channel.setIdent(options.ident);
    warnOfUnknownKeys(context, parts_->channel.protocol(), parts_->configText);
    if (const auto done = parts_->channel.configure(parts_->configText); !done) {
        throw CommandError(ExitCode::Usage, "configuration: " + done.error().text);
    }
}

Session::~Session() = default;

bool Session::portGone() const {
    return parts_->portGone || parts_->serial.portGone();
}

std::uint64_t Session::framesSent() const {
    return parts_->tracing.counts().framesSent;
}

runtime::Result<ITag*, Failure> Session::createTag(const std::string& uri) {
    const auto refuse = [](runtime::ChannelError error) {
        return Failure{std::move(error), ExitCode::Usage};
    };
    try {
        const auto tag = channel().createTag(withoutByteOrder(uri));
        if (!tag) return refuse(tag.error());
        if (!conversionsApply(*tag.value())) {
            return refuse({kConversionError, "the conversions can't be applied to this type"});
        }
        return tag.value();
    } catch (const CommandError& error) {
        return refuse({kGeneralError, error.what()});
    }
}

int Session::nodeOf(const ITag& tag) const {
    const auto* const nodes = parts_->channel.as<IProtocol4>("IProtocol4");
    return nodes == nullptr ? 0 : nodes->GetNodeID(&tag);
}

std::string Session::areaOf(const ITag& tag) const {
    auto* const fields = parts_->channel.as<IProtocol7>("IProtocol7");
    if (fields == nullptr) return {};
    int length = 0;
    const char* const area =
        fields->getTagUriField(&tag, fields->getTagUriFieldPosition("memorytype"), &length);
    return area == nullptr ? "" : std::string(area, static_cast<std::size_t>(std::max(0, length)));
}

Failure Session::failureOf(const ITag& tag, const runtime::ChannelError& error, bool asked) const {
    const ExitCode code = portGone() ? ExitCode::Port : exitCodeOf(error.code);
    if (asked || code != ExitCode::Other) return {error, code};
    // The line knows the low byte of a node only.
    const int node = nodeOf(tag) & kLargestAddress;
    const bool addressable = node > 0 && node < kLargestAddress;
    if (error.code == kNodeRefused && addressable) return {error, code};
    return {error, ExitCode::Usage};
}

runtime::Result<Bytes, Failure> Session::read(const ITag& tag) {
    const std::uint64_t before = framesSent();
    const auto value = channel().read(tag);
    if (!value) return failureOf(tag, value.error(), framesSent() != before);
    return value.value();
}

runtime::Result<runtime::Done, Failure> Session::write(const ITag& tag, ByteView value) {
    const std::uint64_t before = framesSent();
    const auto done = channel().write(tag, value);
    if (!done) return failureOf(tag, done.error(), framesSent() != before);
    return done.value();
}

runtime::Result<runtime::Done, Failure> Session::writeItems(const ITag& tag, ByteView value,
                                                            std::size_t& written) {
    auto* const items = channel().as<IProtocol7>("IProtocol7");
    const std::size_t count = itemCount(shapeOf(tag));
    const std::size_t length = value.size() / std::max<std::size_t>(1, count);
    const std::uint64_t before = framesSent();
    for (written = 0; written < count; ++written) {
        const ByteView item = value.subspan(written * length, length);
        if (items == nullptr ||
            items->writeArrayItem(&tag, static_cast<int>(written), item.data()) == 0) {
            return failureOf(tag, channel().lastError(), framesSent() != before);
        }
    }
    return runtime::Done{};
}

void Session::start() {
    if (!hasLine()) {
        throw CommandError(ExitCode::Usage, "no line: --port com1=/dev/ttyUSB0, or --sim");
    }
    if (parts_->simulator) {
        try {
            parts_->simulator->start();
        } catch (const std::system_error& error) {
            throw CommandError(ExitCode::Port, fmt::format("simulated line: {}", error.what()));
        }
        parts_->mapPort(
            {itemOf(parts_->configText, "uart").value_or("com1"), parts_->simulator->path()});
    }
    if (parts_->storage) {
        reportUnused(parts_->context, *parts_->storage, parts_->channel.protocol().GetIdent());
    }
    if (const auto done = parts_->channel.start(); !done) {
        const std::string reason = parts_->serial.lastError();
        throw CommandError(ExitCode::Port,
                           reason.empty() ? done.error().text : done.error().text + ": " + reason);
    }
    // Without its overrides a request might reach another device than it is meant for.
    checkStorage();
}

bool Session::hasLine() const {
    return parts_->simulator != nullptr || !parts_->ports.empty();
}

runtime::Channel& Session::channel() {
    return parts_->channel;
}

runtime::Storage* Session::storage() {
    return parts_->storage.get();
}

void Session::checkStorage() {
    if (parts_->storage && parts_->storage->failed()) {
        throw CommandError(ExitCode::Other, "storage: " + parts_->storage->lastError());
    }
}

const std::string& Session::configText() const {
    return parts_->configText;
}

}  // namespace cli
