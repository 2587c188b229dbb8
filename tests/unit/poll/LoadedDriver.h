// The loaded plug-in on simulated slaves that answer at once.
#pragma once

#include <cstdint>
#include <memory>
#include <random>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "platform/IProtocol.h"
#include "runtime/Channel.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/ServiceFactory.h"
#include "tests/unit/poll/SlavePort.h"

namespace poll_test {

/// Nodes 1 (Modicon), 2 (items from 0, short requests) and 3 (Enron: 32-bit registers 5000..5999),
/// all areas full, their first and last items of random content.
class LoadedDriver {
  public:
    explicit LoadedDriver(std::uint32_t seed = 1) {
        fill(seed);
        const bool ok = channel_
                            ->configure(
                                "CfgVer=1 uart=com1 baudrate=19200 parity=none stopbits=1 "
                                "mode=RS-232 txMode=RTU defNodeId=1 repeat=0 timeout=10 "
                                "Node1::model=1 Node2::model=2 Node2::maxOptLen=22 "
                                "Node2::maxBitOptLen=37 Node3::model=3")
                            .ok() &&
                        channel_->start().ok();
        if (!ok) throw std::runtime_error(channel_->lastError().text);
    }

    runtime::Channel& channel() { return *channel_; }
    IProtocol4& answers() { return *channel_->as<IProtocol4>("IProtocol4"); }
    sim::Slave& slave() { return slave_; }
    SlavePort& port() { return port_; }

    /// @return a tag of the channel's. Errors: std::runtime_error with the driver's text.
    const ITag* tag(const std::string& uri) {
        auto made = channel_->createTag(uri);
        if (!made) throw std::runtime_error(made.error().text);
        return made.value();
    }
    std::vector<const ITag*> tags(const std::vector<std::string>& uris) {
        std::vector<const ITag*> made;
        for (const std::string& uri : uris)
            made.push_back(tag(uri));
        return made;
    }

  private:
    static sim::NodeOptions node(std::uint8_t address) {
        sim::NodeOptions options{.address = address,
                                 .sizes = {.coils = 65536,
                                           .discreteInputs = 65536,
                                           .holdingRegisters = 65536,
                                           .inputRegisters = 65536}};
        if (address == 3) options.longs = sim::LongRange{};
        return options;
    }
    void fill(std::uint32_t seed) {
        std::minstd_rand random(seed);
        for (const std::uint8_t node : {std::uint8_t{1}, std::uint8_t{2}, std::uint8_t{3}})
            for (const sim::Area area : {sim::Area::Coil, sim::Area::DiscreteInput,
                                         sim::Area::HoldingRegister, sim::Area::InputRegister})
                for (std::uint32_t item = 0; item < 65536; item += item == 4999 ? 60001 : 1)
                    slave_.set(node, area, item, static_cast<std::uint32_t>(random() >> 7U));
        for (std::uint32_t item = 5000; item < 6000; ++item)
            slave_.set(3, sim::Area::LongRegister, item, static_cast<std::uint32_t>(random()) * 5U);
    }
    template <class Value, class Error>
    static Value need(runtime::Result<Value, Error> result) {
        if (!result) throw std::runtime_error(result.error().text);
        return std::move(result).value();
    }

    sim::Slave slave_{{node(1), node(2), node(3)}};
    SlavePort port_{slave_};
    runtime::PosixMultiTask multiTask_;
    runtime::ServiceFactory services_{multiTask_, port_};
    runtime::PluginLibrary library_ = need(runtime::PluginLibrary::load(PLUGIN_FILE));
    runtime::Module module_ = need(runtime::Module::bind(library_, services_));
    std::unique_ptr<runtime::Channel> channel_ =
        std::make_unique<runtime::Channel>(need(module_.createProtocol("MRTU")));
};

}  // namespace poll_test
