// A driver that is loaded to be questioned, on a host that has no serial ports.
#pragma once

#include <memory>
#include <string>

#include "platform/IProtocol.h"

namespace cli {

/// Owns the protocol object and what it stands on. No port is ever opened.
class OfflineDriver {
  public:
    /// @param plugin    The plug-in's file.
    /// @param protocol  The protocol's name in the plug-in, e.g. "MRTU".
    /// Errors: CommandError (Other) when either can't be had.
    OfflineDriver(const std::string& plugin, const std::string& protocol);
    ~OfflineDriver();
    OfflineDriver(const OfflineDriver&) = delete;
    OfflineDriver& operator=(const OfflineDriver&) = delete;

    [[nodiscard]] IProtocol& protocol() const;

    /// @return the driver's description document.
    /// Errors: CommandError (Other).
    [[nodiscard]] std::string description() const;

  private:
    struct Parts;
    std::unique_ptr<Parts> parts_;
};

}  // namespace cli
