// A loaded, configured driver on its line, for as long as one sub-command runs.
#pragma once

#include <memory>
#include <string>

#include "cli/LineOptions.h"
#include "cli/OverrideStorage.h"
#include "runtime/Channel.h"
#include "runtime/Storage.h"

namespace cli {

/// Loads the plug-in, opens the storage and hands the driver its configuration. The line stays
/// closed until start().
class Session {
  public:
    /// @param context  Outlives the session; --trace writes on its `err`.
    /// Errors: CommandError, Usage for the configuration, Other for plug-in and storage.
    Session(CommandContext& context, const LineOptions& options,
            StorageNeed need = StorageNeed::Use);
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    /// Opens the line (and runs the simulator where --sim asks for it). Complains about stored
    /// overrides that are not used.
    /// Errors: CommandError, Usage when the command line names no line, Port with the driver's text
    /// and the run time's reason, Other when the overrides can't be read.
    void start();

    /// Tells whether the command line names a line at all.
    [[nodiscard]] bool hasLine() const;

    runtime::Channel& channel();

    /// Tells whether the port vanished, or did not take a frame.
    [[nodiscard]] bool portGone() const;
    /// @return the exit code of a failed read or write: Port when the port is gone, else as the
    /// driver's error code says.
    [[nodiscard]] ExitCode exitCodeFor(const runtime::ChannelError& error) const;

    /// @return null when overrides are not kept, see openOverrides().
    runtime::Storage* storage();
    /// Errors: CommandError (Other) when the storage has refused anything so far.
    void checkStorage();

    [[nodiscard]] const std::string& configText() const;

  private:
    struct Parts;
    std::unique_ptr<Parts> parts_;
};

}  // namespace cli
