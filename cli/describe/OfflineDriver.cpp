// Loads a driver on services that open no port.
#include "cli/describe/OfflineDriver.h"

#include "cli/ExitCode.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/ServiceFactory.h"
#include "settings/DescriptionBlock.h"

namespace cli {
namespace {

class NoSerialPorts final : public ISerialFactory {
  public:
    void* ConvertTo(const char* name) override {
        return CompareInterface(name, "ISerialFactory") ? static_cast<ISerialFactory*>(this)
                                                        : nullptr;
    }
    const char* GetImpName() const override { return "cli::NoSerialPorts"; }
    int GetImpVersion() const override { return 100; }
    ISerialPort* openPort(const char* /*name*/) override { return nullptr; }
    void releasePort(ISerialPort* /*port*/) override {}
};

template <class Value>
Value valueOf(runtime::Result<Value, runtime::PluginError> result) {
    if (!result) throw CommandError(ExitCode::Other, result.error().text);
    return std::move(result).value();
}

}  // namespace

// The order of the members: the host's services outlive the module, it outlives the protocol.
struct OfflineDriver::Parts {
    runtime::PosixMultiTask multiTask{};
    NoSerialPorts serial{};
    runtime::ServiceFactory host{multiTask, serial};
    runtime::PluginLibrary library;
    runtime::Module module;
    runtime::ProtocolObject protocol;

    Parts(const std::string& plugin, const std::string& name)
        : library(valueOf(runtime::PluginLibrary::load(plugin))),
          module(valueOf(runtime::Module::bind(library, host))),
          protocol(valueOf(module.createProtocol(name))) {}
};

OfflineDriver::OfflineDriver(const std::string& plugin, const std::string& protocol)
    : parts_(std::make_unique<Parts>(plugin, protocol)) {}

OfflineDriver::~OfflineDriver() = default;

IProtocol& OfflineDriver::protocol() const {
    return *parts_->protocol;
}

std::string OfflineDriver::description() const {
    return settings::inflateDescription(protocol().GetXml());
}

}  // namespace cli
