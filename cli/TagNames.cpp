#include "cli/TagNames.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "cli/UsageErrors.h"
#include "settings/FileReader.h"
#include "values/NearestName.h"
#include "values/TextEscapes.h"

namespace cli {
namespace {

/// A list that is wrong all over is mended from the top.
constexpr std::size_t kMostComplaints = 20;

[[noreturn]] void refuseList(CommandContext& context, const std::string& file,
                             const std::vector<poll::ListComplaint>& complaints) {
    const std::size_t shown = std::min(complaints.size(), kMostComplaints);
    for (std::size_t i = 0; i < shown; ++i) {
        const poll::ListComplaint& each = complaints[i];
        complain(context, values::printableText(fmt::format("{}:{}:{}: {}", each.file, each.line,
                                                            each.column, each.text)));
    }
    const std::size_t more = complaints.size() - shown;
    throw CommandError(ExitCode::Usage,
                       more == 0 ? file + ": the list is not used"
                                 : fmt::format("{}: {} more; the list is not used", file, more));
}

std::vector<poll::ListedTag> goodTags(CommandContext& context, const std::string& file) {
    if (file.empty()) return {};
    poll::TagList list = readTagList(file);
    if (!list.complaints.empty()) refuseList(context, file, list.complaints);
    return std::move(list.tags);
}

}  // namespace

void addTagsOption(CommandSpec& command, std::string& file) {
    command.options.push_back({.names = "--tags",
                               .target = &file,
                               .help = "A list of tags: CSV with names and URIs, or a URI a line",
                               .valueName = "FILE"});
}

poll::TagList readTagList(const std::string& file) {
    return withUsageErrors([&] {
        return poll::parseTagList(
            settings::readText("tags", file, {.bytes = settings::kTagListBytes}), file);
    });
}

TagNames::TagNames(CommandContext& context, const std::string& file)
    : TagNames(context, file, goodTags(context, file)) {}

TagNames::TagNames(CommandContext& context, std::string file, std::vector<poll::ListedTag> tags)
    : context_(context), file_(std::move(file)), tags_(std::move(tags)) {
    // Of a plain list that repeats a URI, the first.
    for (std::size_t i = 0; i < tags_.size(); ++i)
        places_.try_emplace(tags_[i].name, i);
}

poll::ListedTag TagNames::tag(const std::string& word) const {
    const auto place = places_.find(word);
    if (place != places_.end()) return tags_[place->second];
    if (!file_.empty() && word.find('?') == std::string::npos)
        throw CommandError(ExitCode::Usage, unknownName(word));
    return {.name = word, .uri = word};
}

std::vector<poll::ListedTag> TagNames::tags(const std::vector<std::string>& words) const {
    if (words.empty()) return tags_;
    std::vector<poll::ListedTag> tags;
    for (const std::string& word : words) {
        try {
            tags.push_back(tag(word));
        } catch (const CommandError& error) {
            complain(context_, error.what());
        }
    }
    if (tags.size() != words.size()) throw CommandError(ExitCode::Usage, "nothing was done");
    return tags;
}

std::string TagNames::unknownName(const std::string& word) const {
    std::vector<std::string> names;
    names.reserve(tags_.size());
    for (const poll::ListedTag& each : tags_)
        names.push_back(each.name);
    const std::string nearest = values::nearestName(word, names);
    return fmt::format("no tag '{}' in {}{}", word, file_,
                       nearest.empty() ? "" : fmt::format("; '{}' perhaps", nearest));
}

}  // namespace cli
