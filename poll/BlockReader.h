// What the poller reads blocks and writes tags through, and the same over a loaded driver.
#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "platform/ITag.h"
#include "poll/Plan.h"
#include "runtime/Channel.h"

namespace poll {

/// Why something failed, as the driver told it: IProtocol::GetLastError() and its text.
struct ReadError {
    int code = 0;
    std::string text;

    bool operator==(const ReadError&) const = default;
};

/// One tag of a block that was read.
struct TagReading {
    bool good = false;
    std::vector<std::uint8_t>
        value{};        ///< In run-time form, ITag::GetVarLength() bytes; good only.
    ReadError error{};  ///< Not good only.
};

/// A line as the poller sees it. Tags are known by their index in the list that was planned.
/// Threads: one at a time.
class BlockSource {
  public:
    virtual ~BlockSource() = default;

    /// Reads a block of the plan. @return one reading for each of block.tags, in their order; all
    /// of them belong to the same moment unless the block takes several requests.
    virtual std::vector<TagReading> read(const Block& block) = 0;
    /// Reads a block to find out whether its node is back. @param wait  For the begin of the reply,
    /// where the line can be told so; 0: as long as ever.
    virtual std::vector<TagReading> probe(const Block& block, std::chrono::milliseconds wait) {
        (void)wait;
        return read(block);
    }
    /// Writes a tag. @param value  In run-time form. @return nothing when the device took it.
    virtual std::optional<ReadError> write(std::size_t tag,
                                           std::span<const std::uint8_t> value) = 0;

    /// Opens the line; open already: nothing. @return false with fault() telling why.
    virtual bool open() = 0;
    /// Closes the line, so that a port that has vanished can come back under its name.
    virtual void close() = 0;
    /// Whether the port has vanished since it was opened.
    virtual bool gone() const = 0;
    /// Why the last open() failed; empty after one that succeeded.
    virtual std::string fault() const { return {}; }
};

/// Reads through a loaded driver: one ReadBlock() or ReadBitBlock() for all tags of a block, whose
/// slices of it the tags convert themselves. A block of one tag goes through Read(), whatever its
/// width.
class ChannelSource final : public BlockSource {
  public:
    /// What the run time knows of the port beside what the driver says.
    struct Port {
        /// Whether it has vanished since it was opened; empty: never.
        std::function<bool()> gone;
        /// Why it could not be opened; empty, or answering "": the driver's text has to do.
        std::function<std::string()> whyNotOpen;
        /// Limits how long the port waits for a reply, from now on and whatever the driver asks
        /// for; 0 ends that. Empty: a probe takes the driver's own time-out.
        std::function<void(std::chrono::milliseconds)> limitWait;
    };

    /// @param channel  Configured; outlives this object. It is stopped by close() alone.
    /// @param tags  Of that channel, by index; none is null; they outlive this object.
    ChannelSource(runtime::Channel& channel, std::vector<const ITag*> tags, Port port = {});

    std::vector<TagReading> read(const Block& block) override;
    std::vector<TagReading> probe(const Block& block, std::chrono::milliseconds wait) override;
    std::optional<ReadError> write(std::size_t tag, std::span<const std::uint8_t> value) override;
    bool open() override;
    void close() override;
    bool gone() const override;
    std::string fault() const override { return fault_; }

  private:
    TagReading readAlone(const ITag& tag);
    bool readImage(const Block& block);
    TagReading slice(const Block& block, const ITag& tag) const;
    ReadError lastError() const;

    runtime::Channel& channel_;
    std::vector<const ITag*> tags_;
    Port port_;
    std::vector<std::uint8_t> image_;  // Of the block being read; kept for its memory.
    std::string fault_;
};

}  // namespace poll
