// The module object of a loaded plug-in, bound to the host's services, and its protocol objects.
#pragma once

#include <memory>
#include <string>

#include "platform/IProtModule.h"
#include "platform/IProtocol.h"
#include "platform/IProtocolFactory.h"
#include "runtime/PluginLibrary.h"
#include "runtime/Result.h"

namespace runtime {

class Module;

/// A protocol object, handed back to its maker on destruction. Keeps its module bound and its
/// library loaded.
class ProtocolObject {
  public:
    ProtocolObject(ProtocolObject&&) noexcept = default;
    ProtocolObject& operator=(ProtocolObject&&) noexcept = default;

    IProtocol& operator*() const { return *protocol_; }
    IProtocol* operator->() const { return protocol_.get(); }
    IProtocol* get() const { return protocol_.get(); }

    /// @return the object as a later generation, e.g. as<IProtocol7>("IProtocol7"), or null when
    /// it is not of that generation.
    template <class Generation>
    Generation* as(const char* name) const {
        return static_cast<Generation*>(protocol_->ConvertTo(name));
    }

  private:
    friend class Module;
    explicit ProtocolObject(std::shared_ptr<IProtocol> protocol) : protocol_(std::move(protocol)) {}

    std::shared_ptr<IProtocol> protocol_;
};

/// One successful IProtModule::Init(), undone by Close() when the last copy and the last protocol
/// object made by it are gone.
class Module {
  public:
    /// Binds the plug-in to the host's services.
    /// @param host  Must outlive the module and its protocol objects.
    /// Errors: NoModule, NoFactory, InitFailed (the text ends in the module's own reason).
    static Result<Module, PluginError> bind(const PluginLibrary& library, IInterfaceFactory& host);

    /// @return a new protocol object.
    /// Errors: UnknownProtocol, ProtocolNotMade.
    Result<ProtocolObject, PluginError> createProtocol(const std::string& name) const;

    const PluginLibrary& library() const;
    IProtModule& interface() const;

  private:
    struct Bound;
    explicit Module(std::shared_ptr<Bound> bound) : bound_(std::move(bound)) {}

    std::shared_ptr<Bound> bound_;
};

}  // namespace runtime
