// A configuration and a list of tags, polled until somebody has seen enough.
#pragma once

#include <memory>

#include "cli/poll/FileWatch.h"
#include "cli/poll/PollPlan.h"
#include "cli/poll/PollRun.h"
#include "poll/Poller.h"

namespace cli {

class PolledLine final : public Polled {
  public:
    /// Reads the files; nothing is polled before start().
    /// @param context, board, clock  Outlive the line; faults are told on the board.
    /// Errors: CommandError, as PollPlan.
    PolledLine(CommandContext& context, NoticeBoard& board, poll::Clock& clock,
               const PollOptions& options);

    void start();
    /// Returns when the port is closed.
    void stop() { poller_.stop(); }

    [[nodiscard]] const ShownTags& tags() const override { return shown_; }
    [[nodiscard]] poll::Snapshot snapshot() const override;
    std::optional<std::string> reload() override;
    bool filesChanged() override { return watch_.changed().has_value(); }

    [[nodiscard]] Session& session() const { return plan_->session(); }
    /// @return the shortest period of a tag.
    [[nodiscard]] std::chrono::milliseconds shortestPeriod() const;

  private:
    std::shared_ptr<PollPlan> makePlan(const PollPlan* beside);
    void tell(const poll::FaultEvent& event);

    CommandContext& context_;
    NoticeBoard& board_;
    NoticeStream lineNotices_;
    CommandContext lineContext_;  ///< Of the line's thread.
    PollOptions options_;
    FileWatch watch_;
    std::shared_ptr<PollPlan> plan_;  ///< What was read last; its line may be another's.
    ShownTags shown_;
    poll::Poller poller_;
};

}  // namespace cli
