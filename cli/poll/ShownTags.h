// The polled tags as people read them: names, scaled values, the last of them. Pure.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "cli/poll/LiveTable.h"
#include "poll/Scaling.h"
#include "poll/Snapshot.h"
#include "poll/TagList.h"
#include "values/Json.h"
#include "values/ValueTypes.h"

namespace cli {

/// By the index that a tag has in the list and in the snapshot.
class ShownTags {
  public:
    ShownTags() = default;
    /// @param shapes  One for each tag.
    ShownTags(std::vector<poll::ListedTag> tags, std::vector<values::ValueShape> shapes);

    [[nodiscard]] std::size_t size() const { return tags_.size(); }
    [[nodiscard]] const std::string& name(std::size_t tag) const { return tags_[tag].name; }
    [[nodiscard]] const std::string& uri(std::size_t tag) const { return tags_[tag].uri; }
    [[nodiscard]] const std::string& unit(std::size_t tag) const { return tags_[tag].unit; }
    [[nodiscard]] values::ValueShape shape(std::size_t tag) const { return shapes_[tag]; }

    /// @param raw  A value in run-time form.
    [[nodiscard]] std::string valueText(std::size_t tag, values::ByteView raw) const;
    /// @return the scaled value: a number, an array, a truth value or a text.
    [[nodiscard]] values::Json jsonValue(std::size_t tag, values::ByteView raw) const;
    /// @return what a sparkline shows: the scaled value, 0 or 1 for a boolean; NaN for the rest.
    [[nodiscard]] double number(std::size_t tag, values::ByteView raw) const;

    /// @return what a filter looks in, one text a tag.
    [[nodiscard]] std::vector<std::string> searchTexts() const;
    [[nodiscard]] ListWidths widths(bool unicode) const;

  private:
    std::vector<poll::ListedTag> tags_;
    std::vector<values::ValueShape> shapes_;
    std::vector<poll::Scaling> scalings_;
};

/// The last values of every tag.
class ValueHistory {
  public:
    static constexpr std::size_t kLength = 12;

    /// Notes what has been read since the last time. A shorter or longer list begins anew.
    void note(const ShownTags& tags, const poll::Snapshot& snapshot);
    void forget() { rings_.clear(); }
    /// @return the oldest first.
    [[nodiscard]] std::vector<double> of(std::size_t tag) const;

  private:
    struct Ring {
        std::uint64_t count = 0;  ///< Good reads of the tag so far.
        std::size_t used = 0;     ///< Values in the ring, at most kLength.
        std::size_t next = 0;
        double values[kLength] = {};
    };
    std::vector<Ring> rings_;
};

/// The rows of one moment.
class ShownRows final : public RowSource {
  public:
    /// All of them outlive this object.
    ShownRows(const ShownTags& tags, const poll::Snapshot& snapshot, const ValueHistory& history,
              std::chrono::system_clock::time_point now)
        : tags_(tags), snapshot_(snapshot), history_(history), now_(now) {}

    [[nodiscard]] TableRow row(std::size_t tag) const override;

  private:
    const ShownTags& tags_;
    const poll::Snapshot& snapshot_;
    const ValueHistory& history_;
    std::chrono::system_clock::time_point now_;
};

/// @return what stands around the rows. @param notice  What was told last.
TableContent contentOf(const poll::Snapshot& snapshot, std::string notice);

}  // namespace cli
