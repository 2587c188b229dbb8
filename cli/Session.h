// A loaded, configured driver on its line, for as long as one sub-command runs.
#pragma once

#include <chrono>
#include <memory>
#include <string>

#include "cli/LineOptions.h"
#include "cli/override/OverrideStorage.h"
#include "runtime/Channel.h"
#include "runtime/Storage.h"
#include "values/LittleEndian.h"

namespace cli {

/// Why an access failed, and what that makes of the exit code.
struct Failure {
    runtime::ChannelError error;
    ExitCode code;
};

/// Loads the plug-in, opens the storage and hands the driver its configuration. The line stays
/// closed until start().
class Session {
  public:
    /// @param context  Outlives the session; --trace writes on its `err`, and keys of the
    /// configuration that the driver does not know are complained of there.
    /// Errors: CommandError, Usage for the configuration, Other for plug-in and storage.
    Session(CommandContext& context, const LineOptions& options,
            StorageNeed need = StorageNeed::Use);
    /// Another driver on the host of a session that lives at the same time: the same plug-in,
    /// ports, storage and simulated line; only configuration and driver are new. Errors: as above.
    Session(CommandContext& context, const LineOptions& options, const Session& beside);
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    /// Opens the line (and runs the simulator where --sim asks for it). Complains about stored
    /// overrides that are not used.
    /// Errors: CommandError, Usage when the command line names no line, Port with the driver's text
    /// and the run time's reason, Other when the overrides can't be read.
    void start();

    /// All of start() but the driver's own: the simulator runs, the port is known. What is repeated
    /// does nothing. For lines that are opened and closed again and again.
    /// Errors: as start().
    void prepareLine();
    /// Tells whether the port has vanished since it was opened last, and why it was not opened.
    [[nodiscard]] bool portVanished() const;
    [[nodiscard]] std::string portFault() const;
    /// From now on no reply is waited for longer than so, whatever the driver asks for; 0: as long
    /// as it asks for. Holds for all sessions on one host.
    void limitWait(std::chrono::milliseconds wait);

    /// Tells whether the command line names a line at all.
    [[nodiscard]] bool hasLine() const;

    [[nodiscard]] runtime::Channel& channel() const;

    /// Makes a tag of a URI, which may name its byte order; it lives as long as the session.
    /// Errors: Usage, also for conversions that can't be applied to any value of the type.
    runtime::Result<ITag*, Failure> createTag(const std::string& uri);

    /// As the channel does. What the driver refuses without asking the device is a wrong URI or
    /// value (Usage), unless an override disabled the node.
    runtime::Result<values::Bytes, Failure> read(const ITag& tag);
    runtime::Result<runtime::Done, Failure> write(const ITag& tag, values::ByteView value);
    /// Writes an array item by item. @param written  Receives the items that the device took.
    runtime::Result<runtime::Done, Failure> writeItems(const ITag& tag, values::ByteView value,
                                                       std::size_t& written);

    /// @return the node that the tag's URI names; 0 from a driver without nodes.
    [[nodiscard]] int nodeOf(const ITag& tag) const;
    /// @return the memory area that the tag's URI names; empty from a driver without fields.
    [[nodiscard]] std::string areaOf(const ITag& tag) const;

    /// Tells whether the port vanished, or did not take a frame.
    [[nodiscard]] bool portGone() const;

    /// @return null when overrides are not kept, see openOverrides().
    runtime::Storage* storage();
    /// Errors: CommandError (Other) when the storage has refused anything so far.
    void checkStorage();

    [[nodiscard]] const std::string& configText() const;

  private:
    struct Host;
    struct Parts;
    Session(CommandContext& context, const LineOptions& options, std::string configText,
            StorageNeed need, std::shared_ptr<Host> host);
    [[nodiscard]] Failure failureOf(const ITag& tag, const runtime::ChannelError& error,
                                    bool asked) const;
    [[nodiscard]] std::uint64_t framesSent() const;

    std::unique_ptr<Parts> parts_;
};

}  // namespace cli
