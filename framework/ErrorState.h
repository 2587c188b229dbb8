// The last failure of a protocol object: a code and a text that belong together.
#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <mutex>
#include <span>
#include <string_view>

#include "framework/PlainMemory.h"

namespace error_state {

struct Failure {
    int code = 1;
    const char* text = "";
};

/// The parts of a text, one behind the other.
using Parts = std::span<const std::string_view>;

/// A place that one failure after another uses.
struct PassingPlace {
    static constexpr std::size_t kOwnText = 256;

    /// @return room for so long a text and its zero, null when there is no memory for it.
    char* roomFor(std::size_t length) noexcept;

    Failure failure;
    std::uint64_t reported = 0;  ///< Number of the last report that used it; 0: none has.
    std::array<char, kOwnText + 1> text{};
    /// Rooms for longer texts, each at least twice as long as the one before it. Outgrown ones
    /// stay, so that whoever still holds one reads old text instead of freed memory.
    std::array<PlainMemory, 24> longTexts{};
    std::size_t longTextCount = 0;
    std::size_t longTextRoom = 0;
};

}  // namespace error_state

/// Code and text of one failure are published together. How long a text that was handed out lasts:
/// - usual failures, whose texts come from a small set, keep their place once they were reported:
///   their texts never change or go away while this object lives. There is room for 64 different
///   failures of up to 128 characters each, 3 KiB in all;
/// - failures that find no such place, and those that quote what they were given, share 8 places in
///   turn: a text stays the same until 8 more different ones of that kind were reported.
/// No text needs memory unless it is longer than 256 characters.
/// Threads: any operation beside any other. Never throws. What is handed out stays readable until
/// this object is destroyed.
class ErrorState {
  public:
    using Failure = error_state::Failure;
    using Parts = error_state::Parts;

    ErrorState() noexcept = default;
    ErrorState(const ErrorState&) = delete;
    ErrorState& operator=(const ErrorState&) = delete;

    /// Reports a failure. A text beyond 256 characters is cut when there is no memory for it.
    void set(int code, std::string_view text) noexcept;

    /// Reports a failure whose text quotes what came from outside.
    /// @return false, with nothing reported, when there is no memory for all of it.
    bool setQuoting(int code, Parts parts) noexcept;

    /// The last failure; code 1 and no text when there was none.
    const Failure& last() const noexcept { return *last_.load(std::memory_order_acquire); }

  private:
    static constexpr std::size_t kLastingFailures = 64;
    static constexpr std::size_t kLastingText = 128;
    static constexpr std::size_t kLastingRoom = 3072;
    static constexpr std::size_t kPassingFailures = 8;

    const Failure* find(int code, Parts parts) noexcept;
    const Failure* useAgain(error_state::PassingPlace& place) noexcept;
    const Failure* addLasting(int code, Parts parts) noexcept;
    const Failure* addPassing(int code, Parts parts, bool mayCut) noexcept;
    void publish(const Failure& failure) noexcept;

    static const Failure kNoFailure;

    std::atomic<const Failure*> last_{&kNoFailure};
    std::mutex mutex_;  // Guards what follows; taken last, never held over a call to others.
    std::array<Failure, kLastingFailures> lasting_{};
    std::size_t lastingCount_ = 0;
    std::array<char, kLastingRoom> lastingTexts_{};
    std::size_t lastingUsed_ = 0;
    std::array<error_state::PassingPlace, kPassingFailures> passing_{};
    std::uint64_t reports_ = 0;
};
