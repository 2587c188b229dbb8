// What became of tags as lines for programs: CSV or one JSON object a line. Pure.
#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <vector>

#include "cli/poll/ShownTags.h"
#include "poll/Snapshot.h"

namespace cli {

enum class RecordForm : std::uint8_t { Csv, Json };
enum class RecordWhen : std::uint8_t {
    Change,  ///< A value, a quality or an error that is another than before.
    Read,    ///< Every good read, too.
};

/// Remembers what it told, and tells what is new.
class PollRecords {
  public:
    PollRecords(RecordForm form, RecordWhen when) : form_(form), when_(when) {}

    /// @return the first line of a CSV; empty for JSON.
    [[nodiscard]] std::string header() const;

    /// @param now  The time of what happened without a read.
    /// @return whole lines, each with its end; empty: nothing new.
    std::string news(const ShownTags& tags, const poll::Snapshot& snapshot,
                     std::chrono::system_clock::time_point now);

    /// Other tags: all of them are told anew.
    void forget() { told_.clear(); }

  private:
    struct Told {
        poll::Quality quality = poll::Quality::Never;
        int error = 0;
        std::uint64_t count = 0;
        std::vector<std::uint8_t> value{};
    };
    [[nodiscard]] bool isNews(const Told& told, const poll::TagState& state) const;

    RecordForm form_;
    RecordWhen when_;
    std::vector<Told> told_;
};

/// @return "2026-03-01T12:00:00.250Z".
std::string timeText(std::chrono::system_clock::time_point time);

}  // namespace cli
