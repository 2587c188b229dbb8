#include "cli/check/CheckedTags.h"

#include <utility>

#include "cli/TagNames.h"

namespace cli {
namespace {

using lint::ListFacts;
using poll::ListedTag;
using settings::Place;

constexpr const char* kArguments = "argument";

/// @return the first of the columns that ask for a number, with its place.
std::pair<const char*, int> scaleOf(const ListedTag& tag) {
    if (tag.scale) return {"the scale", tag.columns.scale};
    if (tag.offset) return {"the offset", tag.columns.offset};
    if (tag.decimals) return {"the number of decimals", tag.columns.decimals};
    return {nullptr, 1};
}

ListFacts listFacts(const ListedTag& tag, const std::string& file) {
    const auto placeAt = [&](int column) { return Place{file, tag.line, column}; };
    const auto [scaledBy, column] = scaleOf(tag);
    ListFacts facts{.name = tag.name == tag.uri ? "" : tag.name,
                    .period = std::nullopt,
                    .periodPlace = placeAt(tag.columns.period),
                    .scaledBy = scaledBy,
                    .scalePlace = placeAt(column),
                    .low = tag.low,
                    .high = tag.high,
                    .limitsPlace = placeAt(tag.columns.low)};
    if (tag.period) facts.period = tag.period->count();
    return facts;
}

/// @param word  Counts the words of the command line from 1.
lint::TagLine lineOf(const ListedTag& tag, const std::string& file, int word) {
    // Only what a list holds has a line.
    if (tag.line == 0) return lint::tagLine(tag.uri, kArguments, word, 1);
    lint::TagLine line = lint::tagLine(tag.uri, file, tag.line, tag.columns.uri);
    line.listed = listFacts(tag, file);
    return line;
}

lint::Findings findingsOf(const std::vector<poll::ListComplaint>& complaints) {
    lint::Findings findings;
    for (const poll::ListComplaint& each : complaints) {
        findings.push_back(
            {lint::Severity::Error, each.rule, {each.file, each.line, each.column}, each.text, {}});
    }
    return findings;
}

}  // namespace

CheckedTags checkedTags(CommandContext& context, const std::string& file,
                        const std::vector<std::string>& words) {
    poll::TagList list;
    if (!file.empty()) list = readTagList(file);
    CheckedTags checked{{}, findingsOf(list.complaints)};
    const TagNames names(context, file, std::move(list.tags));
    const std::vector<ListedTag> tags = checked.findings.empty() ? names.tags(words) : names.all();
    for (const ListedTag& tag : tags)
        checked.tags.push_back(lineOf(tag, file, static_cast<int>(checked.tags.size()) + 1));
    return checked;
}

}  // namespace cli
