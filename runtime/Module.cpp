// Opens a plug-in's module and makes its protocol objects.
#include "runtime/Module.h"

#include <utility>

namespace runtime {
namespace {

/// Asks a plug-in's factory for an interface and hands it back on destruction.
template <class Interface>
class Borrowed {
  public:
    Borrowed(IInterfaceFactory& factory, const char* name)
        : factory_(factory), object_(factory.CreateInterface(name)) {
        if (object_ != nullptr) face_ = static_cast<Interface*>(object_->ConvertTo(name));
    }
    ~Borrowed() {
        if (object_ != nullptr) factory_.ReleaseInterface(object_);
    }
    Borrowed(const Borrowed&) = delete;
    Borrowed& operator=(const Borrowed&) = delete;

    Interface* get() const { return face_; }

  private:
    IInterfaceFactory& factory_;
    IInterface* object_;
    Interface* face_ = nullptr;
};

PluginError fault(PluginFault kind, const PluginLibrary& library, const std::string& why) {
    return {kind, library.path() + ": " + why};
}

}  // namespace

/// The members stand in the order of their need: what is below goes first at the end.
struct Module::Bound {
    explicit Bound(const PluginLibrary& of)
        : library(of),
          module(library.factory(), "IProtModule"),
          factory(library.factory(), "IProtocolFactory") {}
    ~Bound() {
        if (initialised) module.get()->Close();
    }
    Bound(const Bound&) = delete;
    Bound& operator=(const Bound&) = delete;

    PluginLibrary library;
    Borrowed<IProtModule> module;
    Borrowed<IProtocolFactory> factory;
    bool initialised = false;
};

Result<Module, PluginError> Module::bind(const PluginLibrary& library, IInterfaceFactory& host) {
    auto bound = std::make_shared<Bound>(library);
    if (bound->module.get() == nullptr) {
        return fault(PluginFault::NoModule, library, "the driver has no IProtModule");
    }
    if (bound->factory.get() == nullptr) {
        return fault(PluginFault::NoFactory, library, "the driver has no IProtocolFactory");
    }
    if (bound->module.get()->Init(&host) == 0) {
        const char* reason = bound->module.get()->GetLastError();
        const bool given = reason != nullptr && *reason != '\0';
        return fault(PluginFault::InitFailed, library,
                     std::string("Init failed: ") + (given ? reason : "no reason given"));
    }
    bound->initialised = true;
    return Module(std::move(bound));
}

Result<ProtocolObject, PluginError> Module::createProtocol(const std::string& name) const {
    IProtocol* made = nullptr;
    try {
        made = bound_->factory.get()->CreateProtocol(name.c_str());
    } catch (...) {
        // The driver may carry a C++ run time of its own, so the exception's type says nothing.
        return fault(PluginFault::ProtocolNotMade, bound_->library,
                     "protocol '" + name + "' could not be made");
    }
    if (made == nullptr) {
        return fault(PluginFault::UnknownProtocol, bound_->library,
                     "unknown protocol '" + name + "'");
    }
    const auto handBack = [bound = bound_](IProtocol* protocol) {
        bound->factory.get()->DeleteProtocol(protocol);
    };
    return ProtocolObject(std::shared_ptr<IProtocol>(made, handBack));
}

const PluginLibrary& Module::library() const {
    return bound_->library;
}

IProtModule& Module::interface() const {
    return *bound_->module.get();
}

}  // namespace runtime
