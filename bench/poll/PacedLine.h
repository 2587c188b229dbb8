// The loaded plug-in on a simulated line whose characters take their time.
#pragma once

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "poll/BlockReader.h"
#include "runtime/Channel.h"
#include "runtime/ModbusReplies.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"
#include "sim/Simulator.h"

namespace bench {

template <class Value, class Error>
Value valueOf(runtime::Result<Value, Error> result) {
    if (!result) throw std::runtime_error(result.error().text);
    return std::move(result).value();
}

/// 8 data bits, even parity.
inline constexpr wire::LineRate kRate{.baud = 19200, .characterBits = 11};

/// One line with nodes 1..`nodes`, opened. A reply that a busy machine cuts is asked for again.
/// Errors: std::runtime_error, std::system_error.
class PacedLine {
  public:
    PacedLine(const std::string& plugin, int nodes, runtime::FrameEndBy frameEnd)
        : simulator_(simulated(nodes)), library_(valueOf(runtime::PluginLibrary::load(plugin))) {
        simulator_.start();
        serial_.mapPort("com1", simulator_.path());
        serial_.setReplyRules(std::make_shared<runtime::ModbusReplies>());
        serial_.setFrameEnd(frameEnd);
        valueOf(
            channel_.configure("CfgVer=1 defNodeId=1 uart=com1 baudrate=19200 parity=even "
                               "bits=8 stopbits=1 mode=RS-232 txMode=RTU repeat=2 "
                               "timeout=1000"));
        valueOf(channel_.start());
    }

    runtime::Channel& channel() { return channel_; }
    std::vector<const ITag*> tags(const std::vector<std::string>& uris) {
        std::vector<const ITag*> made;
        made.reserve(uris.size());
        for (const std::string& uri : uris)
            made.push_back(valueOf(channel_.createTag(uri)));
        return made;
    }

  private:
    static sim::SimulatorOptions simulated(int nodes) {
        sim::SimulatorOptions options;
        options.rate = kRate;
        options.nodes.clear();
        for (int node = 1; node <= nodes; ++node)
            options.nodes.push_back({.address = static_cast<std::uint8_t>(node)});
        return options;
    }

    sim::Simulator simulator_;
    runtime::PosixMultiTask multiTask_;
    runtime::PosixSerialFactory serial_;
    runtime::ServiceFactory services_{multiTask_, serial_};
    runtime::PluginLibrary library_;
    runtime::Module module_ = valueOf(runtime::Module::bind(library_, services_));
    runtime::Channel channel_{valueOf(module_.createProtocol("MRTU"))};
};

}  // namespace bench
