// One protocol object on one line, with answers that carry their errors.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "runtime/Module.h"
#include "runtime/Result.h"

namespace runtime {

/// What the driver said after a refusal: IProtocol::GetLastError() and its text.
struct ChannelError {
    int code = 0;
    std::string text;
};

/// Owns the protocol object. Stops it and hands it back on destruction.
/// Threads: as IProtocol says; with several reading threads an error may be another thread's.
class Channel {
  public:
    explicit Channel(ProtocolObject protocol) : protocol_(std::move(protocol)) {}
    Channel(Channel&&) noexcept = default;
    Channel& operator=(Channel&&) = delete;
    ~Channel();

    /// Names the section of the permanent storage that this channel's overrides live in.
    /// REQUIRES: before start().
    void setIdent(const std::string& ident);

    /// Takes the configuration text. REQUIRES: before start().
    Result<Done, ChannelError> configure(const std::string& text);
    Result<Done, ChannelError> start();
    void stop();
    bool started() const { return started_; }

    /// @return a tag that belongs to the channel until freeTag() or the end of the channel.
    Result<ITag*, ChannelError> createTag(const std::string& uri);
    void freeTag(ITag* tag);

    /// @return the tag's value in run-time form, GetVarLength() bytes.
    Result<std::vector<std::uint8_t>, ChannelError> read(const ITag& tag);
    /// Reads into a buffer of the caller's. REQUIRES: value.size() >= GetVarLength().
    Result<Done, ChannelError> readInto(const ITag& tag, std::span<std::uint8_t> value);
    /// Writes a value in run-time form. A value whose size is not GetVarLength() is refused with
    /// code -1 before the driver sees it.
    Result<Done, ChannelError> write(const ITag& tag, std::span<const std::uint8_t> value);

    /// Runs one console command.
    /// @param limit  The longest answer in bytes; a longer one is cut.
    /// @return the answer as the driver gave it, nothing when the command was not recognised or
    /// the driver has no console.
    std::optional<std::string> command(const std::string& line, int limit = kAnswerLimit);
    /// @return the driver's report of its line settings, nothing when it has none.
    std::optional<std::string> communicationParameters() const;

    /// The driver's last failure, whatever operation it came from.
    ChannelError lastError() const;

    IProtocol& protocol() const { return *protocol_; }
    /// @return the object as a later generation or null, e.g. as<IProtocol7>("IProtocol7").
    template <class Generation>
    Generation* as(const char* name) const {
        return protocol_.as<Generation>(name);
    }

    /// Holds the longest answer there is, that of the command "xml".
    static constexpr int kAnswerLimit = 64 * 1024;

  private:
    Result<Done, ChannelError> outcome(int accepted) const;

    ProtocolObject protocol_;
    bool started_ = false;
};

}  // namespace runtime
