// A driver plug-in in memory: loaded, checked to be a driver, unloaded with its last user.
#pragma once

#include <memory>
#include <string>

#include "platform/IInterfaceFactory.h"
#include "runtime/Result.h"

namespace runtime {

/// Why a plug-in, its module object or one of its protocols could not be had.
enum class PluginFault {
    NoSuchFile,       ///< There is no file of that name, or it can't be read.
    NotALibrary,      ///< The system's loader refuses the file, or one that it needs.
    NotADriver,       ///< A library, but without the entry GetInterfaceFactory.
    NoModule,         ///< The driver has no interface "IProtModule".
    NoFactory,        ///< The driver has no interface "IProtocolFactory".
    InitFailed,       ///< IProtModule::Init() said no.
    UnknownProtocol,  ///< The driver has no protocol of that name.
    ProtocolNotMade,  ///< The driver failed while it made the protocol object.
};

struct PluginError {
    PluginFault fault;
    std::string text;  ///< One line for a person; names the file.
};

/// A loaded plug-in. Copies share the library, which is unloaded with the last of them; the
/// objects of runtime/Module.h each hold a copy, so the order of destruction does not matter.
class PluginLibrary {
  public:
    /// Loads the library with all its symbols bound and none of them made visible to others.
    /// @param path  A file; a bare name means the working directory, never a search path.
    /// Errors: NoSuchFile, NotALibrary, NotADriver; nothing stays loaded then.
    static Result<PluginLibrary, PluginError> load(const std::string& path);

    /// The plug-in's factory, as long as a copy of this object lives.
    IInterfaceFactory& factory() const { return *factory_; }
    const std::string& path() const { return path_; }

  private:
    PluginLibrary(std::shared_ptr<void> handle, IInterfaceFactory& factory, std::string path)
        : handle_(std::move(handle)), factory_(&factory), path_(std::move(path)) {}

    std::shared_ptr<void> handle_;
    IInterfaceFactory* factory_;
    std::string path_;
};

}  // namespace runtime
