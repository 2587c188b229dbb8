// Keeps what is polled in step with the files.
#include "cli/poll/PolledLine.h"

#include <algorithm>

#include "cli/poll/PollEvents.h"

namespace cli {

PolledLine::PolledLine(CommandContext& context, NoticeBoard& board, poll::Clock& clock,
                       const PollOptions& options)
    : context_(context),
      board_(board),
      lineNotices_(board),
      lineContext_{.out = lineNotices_, .err = lineNotices_, .pluginOption = context.pluginOption},
      options_(options),
      watch_({options.line.configFile, options.tagsFile}),
      plan_(makePlan(nullptr)),
      shown_(plan_->shown()),
      poller_([this](const poll::LineSetup&) { return PollPlan::source(plan_); }, clock,
              [this](const poll::FaultEvent& event) { tell(event); }) {}

std::shared_ptr<PollPlan> PolledLine::makePlan(const PollPlan* beside) {
    watch_.beginReading();
    auto plan = std::make_shared<PollPlan>(context_, board_, lineContext_, options_, beside);
    if (const auto torn = watch_.tornFile())
        throw CommandError(ExitCode::Other, *torn + ": changed while it was read");
    return plan;
}

void PolledLine::start() {
    const SignalsHeld heldForTheThreads;
    if (const auto refusal = poller_.start({plan_->setup()}))
        throw CommandError(ExitCode::Usage, *refusal);
}

poll::Snapshot PolledLine::snapshot() const {
    auto lines = poller_.snapshot();
    return lines.empty() ? poll::Snapshot{} : std::move(lines.front().snapshot);
}

std::optional<std::string> PolledLine::reload() {
    const SignalsHeld heldForTheThreads;
    const std::shared_ptr<PollPlan> before = plan_;
    try {
        plan_ = makePlan(before.get());
        if (auto refusal = poller_.reload({plan_->setup()})) {
            plan_ = before;
            return refusal;
        }
    } catch (const std::exception& error) {
        plan_ = before;
        return error.what();
    }
    shown_ = plan_->shown();
    return {};
}

void PolledLine::tell(const poll::FaultEvent& event) {
    const bool ends = event.kind == poll::FaultEvent::Kind::Ends;
    board_.tell(event.line + ": " + event.subject + ": " + event.text + (ends ? ": over" : ""));
}

std::chrono::milliseconds PolledLine::shortestPeriod() const {
    std::chrono::milliseconds shortest{options_.intervalMs};
    for (const poll::TagPlace& place : plan_->setup().places)
        shortest = std::min(shortest, place.period);
    return shortest;
}

}  // namespace cli
