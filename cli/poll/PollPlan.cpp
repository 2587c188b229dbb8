// Loads the driver, makes the tags, plans the reads.
#include "cli/poll/PollPlan.h"

#include <fmt/format.h>

#include <algorithm>

#include "cli/Choices.h"
#include "cli/TagNames.h"
#include "cli/UsageErrors.h"
#include "poll/BlockReader.h"
#include "poll/LineCosts.h"
#include "poll/TagPlacing.h"
#include "settings/ConfigScan.h"
#include "settings/ConfigText.h"
#include "settings/DescriptionBlock.h"
#include "settings/DriverDescription.h"

namespace cli {
namespace {

/// How often the driver repeats a request that failed; what it takes without a word of the
/// configuration stands in its description.
int repeatsOf(const std::string& configText, const settings::Description& description) {
    constexpr const char* key = "repeat";
    constexpr int most = 255;
    std::string text;
    for (const settings::ParameterInfo& parameter : description.parameters) {
        if (parameter.key == key) text = parameter.defaultValue.value_or("");
    }
    text = settings::itemOf(configText, key).value_or(text);
    return static_cast<int>(std::max(0L, plainNumber(text, most)));
}

std::vector<poll::ListedTag> listedTags(CommandContext& context, const std::string& file) {
    std::vector<poll::ListedTag> tags = TagNames(context, file).all();
    if (tags.empty()) throw CommandError(ExitCode::Usage, file + ": the list has no tags");
    return tags;
}

/// A line whose port is opened and closed while the driver stays.
class SessionSource final : public poll::BlockSource {
  public:
    SessionSource(std::shared_ptr<PollPlan> plan, std::vector<const ITag*> tags)
        : plan_(std::move(plan)),
          source_(
              plan_->session().channel(), std::move(tags),
              {.gone = [this] { return plan_->session().portVanished(); },
               .whyNotOpen = [this] { return plan_->session().portFault(); },
               .limitWait =
                   [this](std::chrono::milliseconds wait) { plan_->session().limitWait(wait); }}) {}

    std::vector<poll::TagReading> read(const poll::Block& block) override {
        return source_.read(block);
    }
    std::optional<poll::ReadError> write(std::size_t tag,
                                         std::span<const std::uint8_t> value) override {
        return source_.write(tag, value);
    }
    bool open() override {
        fault_.clear();
        try {
            plan_->session().prepareLine();
            if (!source_.open()) return false;
            // Without its overrides a request might reach another device than it is meant for.
            plan_->session().checkStorage();
            return true;
        } catch (const std::exception& error) {
            fault_ = error.what();
            source_.close();
            return false;
        }
    }
    void close() override { source_.close(); }
    [[nodiscard]] bool gone() const override { return source_.gone(); }
    [[nodiscard]] std::string fault() const override {
        return fault_.empty() ? source_.fault() : fault_;
    }

  private:
    std::shared_ptr<PollPlan> plan_;
    poll::ChannelSource source_;
    std::string fault_;
};

}  // namespace

PollPlan::PollPlan(CommandContext& context, NoticeBoard& board, CommandContext& lineContext,
                   const PollOptions& options, const PollPlan* beside)
    : options_(options),
      notices_(board),
      quiet_{.out = notices_, .err = notices_, .pluginOption = context.pluginOption} {
    const std::vector<poll::ListedTag> tags = listedTags(context, options.tagsFile);
    session_ = beside == nullptr
                   ? std::make_unique<Session>(lineContext, options_.line)
                   : std::make_unique<Session>(quiet_, options_.line, beside->session());
    if (!session_->hasLine())
        throw CommandError(ExitCode::Usage, "no line: --port com1=/dev/ttyUSB0, or --sim");
    createTags(context, tags);
    withUsageErrors([&] { makeSetup(tags); });
    shown_ = ShownTags(tags, shapes_);
}

void PollPlan::createTags(CommandContext& context, const std::vector<poll::ListedTag>& tags) {
    std::size_t refused = 0;
    for (const poll::ListedTag& listed : tags) {
        const auto tag = session_->createTag(listed.uri);
        if (tag) {
            tags_.push_back(tag.value());
            shapes_.push_back(values::shapeOf(*tag.value()));
            continue;
        }
        ++refused;
        complain(context, fmt::format("{}:{}:{}: {}: error {}: {}", options_.tagsFile, listed.line,
                                      listed.columns.uri, listed.uri, tag.error().error.code,
                                      tag.error().error.text));
    }
    if (refused == 0) return;
    throw CommandError(ExitCode::Usage, fmt::format("{}: the driver refuses {} of {} tags",
                                                    options_.tagsFile, refused, tags.size()));
}

void PollPlan::makeSetup(const std::vector<poll::ListedTag>& tags) {
    const runtime::Channel& channel = session_->channel();
    const settings::Description description =
        settings::parseDescription(settings::inflateDescription(channel.protocol().GetXml()));
    for (std::size_t i = 0; i < tags.size(); ++i) {
        auto place = poll::placeOf(*tags_[i], channel, description);
        if (!place)
            throw CommandError(ExitCode::Other, tags[i].uri + ": the driver does not tell where");
        place->period = tags[i].period.value_or(std::chrono::milliseconds(options_.intervalMs));
        setup_.tagNames.push_back(tags[i].name);
        setup_.uris.push_back(tags[i].uri);
        setup_.places.push_back(*std::move(place));
    }
    const std::string& text = session_->configText();
    const settings::ScannedConfig config = settings::scanConfig(options_.line.configFile, text);
    const poll::LineHabits habits{.endsByLength = options_.line.frameEnd == "length",
                                  .shortestGap = std::chrono::milliseconds(options_.line.minGapMs)};
    setup_.name = settings::itemOf(text, "uart").value_or("com1");
    setup_.configuration = text;
    setup_.repeats = repeatsOf(text, description);
    setup_.blocks =
        poll::makePlan(setup_.places, poll::limitsOf(setup_.places, config, description),
                       poll::costsOf(config, description, poll::nodesOf(setup_.places), habits))
            .blocks;
}

std::unique_ptr<poll::BlockSource> PollPlan::source(std::shared_ptr<PollPlan> plan) {
    std::vector<const ITag*> tags = plan->tags_;
    return std::make_unique<SessionSource>(std::move(plan), std::move(tags));
}

}  // namespace cli
