// From files and options to what is polled.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "cli/LineOptions.h"
#include "cli/Session.h"
#include "cli/poll/NoticeBoard.h"
#include "cli/poll/ShownTags.h"
#include "poll/LineSetup.h"

namespace cli {

struct PollOptions {
    LineOptions line;
    std::string tagsFile;
    int intervalMs = 1000;  ///< The period of tags that have none of their own.
};

/// A configured driver that is not started, its tags, and the plan to read them.
class PollPlan {
  public:
    /// Reads the files.
    /// @param context  For complaints about the list; not used later.
    /// @param board  Outlives the plan: what driver and line tell goes there.
    /// @param lineContext  Outlives the plan and those made beside it: the line tells on it.
    /// @param beside  A plan that lives at the same time; null: there is none.
    /// Errors: CommandError; a list with a tag that the driver refuses is refused as a whole.
    PollPlan(CommandContext& context, NoticeBoard& board, CommandContext& lineContext,
             const PollOptions& options, const PollPlan* beside);

    [[nodiscard]] const poll::LineSetup& setup() const { return setup_; }
    [[nodiscard]] const ShownTags& shown() const { return shown_; }
    [[nodiscard]] Session& session() const { return *session_; }

    /// @return what reads the tags; it keeps the plan alive.
    static std::unique_ptr<poll::BlockSource> source(std::shared_ptr<PollPlan> plan);

  private:
    void createTags(CommandContext& context, const std::vector<poll::ListedTag>& tags);
    void makeSetup(const std::vector<poll::ListedTag>& tags);

    PollOptions options_;
    NoticeStream notices_;
    CommandContext quiet_;  ///< The session's own: its thread tells on it.
    std::unique_ptr<Session> session_;
    std::vector<const ITag*> tags_;
    std::vector<values::ValueShape> shapes_;
    ShownTags shown_;
    poll::LineSetup setup_;
};

}  // namespace cli
