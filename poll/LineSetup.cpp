#include "poll/LineSetup.h"

#include <fmt/format.h>

#include <algorithm>
#include <set>
#include <utility>

namespace poll {

namespace {

using Complaint = std::optional<std::string>;
using Names = std::set<std::string>;

std::string tagText(const LineSetup& setup, std::size_t tag) {
    return fmt::format("{}: tag {}", setup.name, setup.tagNames[tag]);
}

Complaint aboutTags(const LineSetup& setup, Names& tags) {
    const std::size_t count = setup.places.size();
    if (count != setup.tagNames.size() || count != setup.uris.size())
        return fmt::format("{}: {} names and {} URIs for {} tags", setup.name,
                           setup.tagNames.size(), setup.uris.size(), count);
    for (std::size_t tag = 0; tag < count; ++tag)
        if (!tags.insert(setup.tagNames[tag]).second)
            return fmt::format("{} is polled twice", tagText(setup, tag));
    return {};
}

bool holds(const Block& block, const TagPlace& place) {
    return place.node == block.node && place.area == block.area && place.bits == block.bits &&
           place.first >= block.first && place.first + place.items <= block.first + block.items;
}

Complaint aboutBlock(const LineSetup& setup, const Block& block, std::vector<bool>& isPlanned) {
    if (block.tags.empty() || block.period <= block.period.zero() || block.requests < 0)
        return fmt::format("{}: a block without tags or period", setup.name);
    for (const std::size_t tag : block.tags) {
        if (tag >= setup.places.size())
            return fmt::format("{}: a block of a tag that is not in the list", setup.name);
        if (isPlanned[tag]) return fmt::format("{} stands in two blocks", tagText(setup, tag));
        if (!holds(block, setup.places[tag]))
            return fmt::format("{} lies outside its block", tagText(setup, tag));
        isPlanned[tag] = true;
    }
    return {};
}

Complaint aboutPatience(const LineSetup& setup) {
    const Patience& patience = setup.patience;
    const auto shortest =
        std::min({patience.firstProbe, patience.longestPause, patience.reopen, patience.holeRetry});
    if (patience.failures >= 1 && shortest.count() > 0 && setup.repeats >= 0) return {};
    return fmt::format("{}: pauses and numbers of failures must be above 0", setup.name);
}

Complaint aboutLine(const LineSetup& setup, Names& tags) {
    if (Complaint complaint = aboutPatience(setup)) return complaint;
    if (Complaint complaint = aboutTags(setup, tags)) return complaint;
    std::vector<bool> isPlanned(setup.places.size());
    for (const Block& block : setup.blocks)
        if (Complaint complaint = aboutBlock(setup, block, isPlanned)) return complaint;
    return {};
}

bool sameBlock(const Block& a, const Block& b) {
    return a.node == b.node && a.area == b.area && a.bits == b.bits && a.itemBytes == b.itemBytes &&
           a.first == b.first && a.items == b.items && a.tags == b.tags && a.period == b.period &&
           a.requests == b.requests;
}

bool samePlace(const TagPlace& a, const TagPlace& b) {
    return a.node == b.node && a.area == b.area && a.bits == b.bits && a.first == b.first &&
           a.items == b.items && a.itemBytes == b.itemBytes;
}

}  // namespace

std::optional<std::string> complaintAbout(const std::vector<LineSetup>& setups) {
    Names lines;
    Names tags;
    for (const LineSetup& setup : setups) {
        if (!lines.insert(setup.name).second)
            return fmt::format("{}: the line is polled twice", setup.name);
        if (Complaint complaint = aboutLine(setup, tags)) return complaint;
    }
    return {};
}

bool sameWork(const LineSetup& a, const LineSetup& b) {
    return a.name == b.name && a.configuration == b.configuration && a.tagNames == b.tagNames &&
           a.uris == b.uris && a.repeats == b.repeats && a.patience == b.patience &&
           std::equal(a.places.begin(), a.places.end(), b.places.begin(), b.places.end(),
                      samePlace) &&
           std::equal(a.blocks.begin(), a.blocks.end(), b.blocks.begin(), b.blocks.end(),
                      sameBlock);
}

}  // namespace poll
