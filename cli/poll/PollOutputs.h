// The two ways in which a poll is shown: as lines for programs, and as a live table.
#pragma once

#include <iosfwd>
#include <string>

#include "cli/poll/NoticeBoard.h"
#include "cli/poll/PollRecords.h"
#include "cli/poll/PollRun.h"
#include "cli/poll/ScreenWriter.h"
#include "cli/poll/TerminalScreen.h"

namespace cli {

/// Lines that are written whole: all that a moment brings goes out at once.
class RecordOutput final : public PollOutput {
  public:
    RecordOutput(std::ostream& out, NoticeBoard& board, RecordForm form, RecordWhen when);

    bool show(const ShownTags& tags, const poll::Snapshot& snapshot,
              std::chrono::system_clock::time_point now) override;
    bool take(const Happened&) override { return true; }
    void changeTags(const ShownTags&) override { records_.forget(); }
    void notice(const std::string& text) override { board_.tell(text); }

    /// Tells whether writing failed because nobody reads any more, which is no failure.
    [[nodiscard]] bool readerGone() const { return readerGone_; }

  private:
    std::ostream& out_;
    NoticeBoard& board_;
    PollRecords records_;
    bool begun_ = false;
    bool readerGone_ = false;
};

/// The table on the terminal.
class TableOutput final : public PollOutput {
  public:
    TableOutput(NoticeBoard& board, TerminalAbilities abilities);

    bool show(const ShownTags& tags, const poll::Snapshot& snapshot,
              std::chrono::system_clock::time_point now) override;
    bool take(const Happened& happened) override;
    void changeTags(const ShownTags& tags) override;
    void notice(const std::string& text) override { board_.tell(text); }

  private:
    NoticeBoard& board_;
    TableStyle style_;
    TableView view_;
    ValueHistory history_;
    KeyDecoder keys_;
    ScreenWriter writer_;
    TerminalScreen terminal_;
};

}  // namespace cli
