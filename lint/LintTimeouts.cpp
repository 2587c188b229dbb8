// The time that replies take against the time that the driver waits for them.
#include "lint/LintTimeouts.h"

#include <fmt/format.h>

#include <algorithm>
#include <chrono>

#include "lint/ReadLengths.h"
#include "settings/ConfigText.h"
#include "settings/LineFormat.h"
#include "settings/NodeValue.h"
#include "settings/NumberText.h"
#include "wire/Times.h"

namespace lint {
namespace {

using settings::AreaInfo;
using settings::Description;
using settings::LineFormat;
using settings::NodeValue;
using settings::ScannedConfig;

/// One timeout of the configuration and the longest reply that it must suffice for.
struct Demand {
    NodeValue timeout;
    std::size_t characters = 0;
    std::string reply;  ///< "the reply to '...'"
};

/// Rounded up, but not for the nanosecond that each part of a sum is rounded up by.
long wholeMs(std::chrono::nanoseconds time) {
    using namespace std::chrono;
    return static_cast<long>(ceil<milliseconds>(floor<microseconds>(time)).count());
}

/// From the end of a request to the first byte of its reply, at least: the silence by which a slave
/// knows that the request is over, and the byte itself.
long firstByteMs(const LineFormat& line) {
    const auto byte = wire::timeOfCharacters(1, line.rate);
    const bool rtu = line.mode == wire::Mode::Rtu;
    return wholeMs(rtu ? wire::silenceBetweenFrames(line.rate) + byte : byte);
}

/// From a reply's first byte to its last.
long restMs(const LineFormat& line, std::size_t characters) {
    return wholeMs(wire::timeOfCharacters(characters - 1, line.rate));
}

/// A tenth more, in tens: what can be written without thinking about it again.
long roundTimeout(long ms) {
    constexpr long kStep = 10;
    return (ms + ms / 10 + kStep) / kStep * kStep;
}

void note(std::vector<Demand>& demands, const Demand& more) {
    const auto same = std::find_if(demands.begin(), demands.end(), [&](const Demand& each) {
        return each.timeout.item == more.timeout.item;
    });
    if (same == demands.end())
        demands.push_back(more);
    else if (same->characters < more.characters)
        *same = more;
}

std::vector<Demand> demandsOfTags(const ScannedConfig& config, const Description& description,
                                  const std::vector<TagLine>& tags, wire::Mode mode) {
    std::vector<Demand> demands;
    for (const TagLine& tag : tags) {
        if (!tag.facts || !tag.wellFormed()) continue;
        const AreaInfo* area = description.area(tag.area());
        const auto timeout = settings::nodeValue(config, description, tag.facts->node, "timeout");
        if (area == nullptr || !timeout) continue;
        const long long bytes = longestReadOf(tag, *area, config, description);
        if (bytes <= 0) continue;
        note(demands,
             {*timeout, replyCharacters(mode, bytes), fmt::format("the reply to '{}'", tag.uri)});
    }
    return demands;
}

std::vector<Demand> demandsOfNodes(const ScannedConfig& config, const Description& description,
                                   wire::Mode mode) {
    std::vector<Demand> demands;
    for (const int node : settings::nodesOf(config)) {
        const auto timeout = settings::nodeValue(config, description, node, "timeout");
        if (!timeout) continue;
        long long bytes = 0;
        for (const AreaInfo& area : description.areas)
            bytes = std::max(bytes, longestRead(area, node, config, description));
        if (bytes > 0) note(demands, {*timeout, replyCharacters(mode, bytes), "the longest reply"});
    }
    return demands;
}

void judge(const Demand& demand, const LineFormat& line, const settings::Place& lineRate,
           Findings& out) {
    const long first = firstByteMs(line);
    const long rest = restMs(line, demand.characters);
    const long timeout = demand.timeout.value;
    if (timeout >= std::max(first, rest)) return;
    const bool isDefault = demand.timeout.item == nullptr;
    const std::string subject =
        fmt::format("{}timeout={}", isDefault ? "the default " : "", timeout);
    const std::string reason =
        timeout < first
            ? fmt::format("is over before a reply can begin, {} ms after the request", first)
            : fmt::format("cuts {}: its {} characters go on for {} ms after the first",
                          demand.reply, demand.characters, rest);
    const std::string key = isDefault ? "timeout" : demand.timeout.item->name;
    warn(out, "short-timeout", isDefault ? lineRate : demand.timeout.item->valuePlace,
         fmt::format("{} {}, at {} baud and {} bits a character", subject, reason, line.rate.baud,
                     line.rate.characterBits),
         fmt::format("write {}={}, or more for a device that takes its time to answer", key,
                     roundTimeout(std::max(first, rest))));
}

}  // namespace

Findings lintTimeouts(const ScannedConfig& config, const Description& description,
                      const std::vector<TagLine>& tags) {
    Findings out;
    const LineFormat line = settings::lineFormatOf(config);
    const settings::ScannedItem* const rate = config.item("baudrate");
    if (rate == nullptr || line.rate.baud <= 0) return out;
    const std::vector<Demand> demands = tags.empty()
                                            ? demandsOfNodes(config, description, line.mode)
                                            : demandsOfTags(config, description, tags, line.mode);
    for (const Demand& demand : demands)
        judge(demand, line, rate->valuePlace, out);
    return out;
}

}  // namespace lint
