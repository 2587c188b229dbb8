// The loaded plug-in on a simulated line, the whole way from the host's call to a slave's memory.
#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <string>
#include <utility>

#include "runtime/Channel.h"
#include "runtime/MemoryStorage.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"
#include "sim/Simulator.h"

/// A slave with address 1 on "com1", and a driver that is configured and started.
class DriverLine {
  public:
    /// @param items  Stand in front of the usual configuration; the first occurrence counts.
    explicit DriverLine(const std::string& items = "") {
        simulator.start();
        serial_.mapPort("com1", simulator.path());
        channel_ = std::make_unique<runtime::Channel>(protocolOf());
        const bool ok = channel_
                            ->configure("CfgVer=1 " + items +
                                        " txMode=RTU uart=com1 baudrate=115200 parity=none "
                                        "stopbits=1 mode=RS-232 defNodeId=1 timeout=20000")
                            .ok() &&
                        channel_->start().ok();
        if (!ok) throw std::runtime_error(channel_->lastError().text);
    }

    IProtocol2& driver() const {
        return *static_cast<IProtocol2*>(channel_->protocol().ConvertTo("IProtocol2"));
    }
    const ITag* tag(const char* uri) { return channel_->createTag(uri).value(); }
    std::string lastError() const { return channel_->lastError().text; }

    sim::Simulator simulator{{.nodes = {{.address = 1}}}};

  private:
    template <class Value>
    static Value& need(Value& result) {
        if (!result.ok()) throw std::runtime_error(result.error().text);
        return result;
    }
    runtime::ProtocolObject protocolOf() {
        auto made = module_.value().createProtocol("MRTU");
        return std::move(need(made)).value();
    }

    using Library = decltype(runtime::PluginLibrary::load(std::string()));

    runtime::PosixMultiTask multiTask_;
    runtime::PosixSerialFactory serial_;
    runtime::MemoryStorage storage_;
    runtime::ServiceFactory services_{multiTask_, serial_, &storage_};
    Library library_ = runtime::PluginLibrary::load(PLUGIN_FILE);
    decltype(runtime::Module::bind(library_.value(), services_)) module_ =
        runtime::Module::bind(need(library_).value(), services_);
    std::unique_ptr<runtime::Channel> channel_;
};
