// A plug-in file, loaded as a host loads it.
#pragma once

#include <filesystem>
#include <memory>
#include <string>

#include "platform/IInterfaceFactory.h"
#include "platform/IProtModule.h"
#include "platform/IProtocol.h"
#include "platform/IProtocolFactory.h"

namespace abi_test {

class Plugin {
  public:
    /// Throws std::runtime_error with the loader's words when the file cannot be loaded.
    explicit Plugin(const std::filesystem::path& file);
    ~Plugin();
    Plugin(const Plugin&) = delete;
    Plugin& operator=(const Plugin&) = delete;

    IProtModule& module() const;
    IProtocolFactory& protocols() const;
    void* symbol(const char* name) const;

    /// Whether the file is loaded, by whomever.
    static bool isLoaded(const std::filesystem::path& file);

  private:
    IInterface* interface(const char* name) const;

    void* handle_;
};

/// What the console of the protocol answers to the command; it must accept it.
std::string command(IProtocol& protocol, const char* line);

/// The plug-in and its engine, copied into a folder of their own that goes with this object.
class PluginCopy {
  public:
    PluginCopy();
    ~PluginCopy();
    PluginCopy(const PluginCopy&) = delete;
    PluginCopy& operator=(const PluginCopy&) = delete;

    const std::filesystem::path& file() const { return file_; }

  private:
    std::filesystem::path folder_;
    std::filesystem::path file_;
};

}  // namespace abi_test
