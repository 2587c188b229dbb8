// What `mrtu plan` tells about a plan. Pure.
#pragma once

#include <string>
#include <vector>

#include "poll/Rivals.h"
#include "settings/ConfigScan.h"
#include "settings/DriverDescription.h"

namespace cli {

struct PlanReport {
    struct BlockLine {
        poll::Block block;
        long address;  ///< Of the first item, as people write it.
        std::size_t characters;
        double load;
    };
    struct NodeLine {
        int node;
        std::size_t tags = 0;
        poll::PlanSums sums{};
    };
    struct Rival {
        std::string name;
        poll::PlanSums sums;
    };

    std::vector<std::string> names;  ///< Of the tags, by index.
    poll::CostModel costs;
    std::vector<BlockLine> blocks;
    std::vector<NodeLine> nodes;
    poll::PlanSums sums;
    std::vector<Rival> rivals;  ///< One request a tag, then the fixed gaps.
    std::size_t bestGap = 0;    ///< Which of the rivals has the fixed gap with the least load.
    /// The shortest period that all tags can have together.
    std::chrono::nanoseconds shortestPeriod{0};
    std::vector<std::size_t> blamed;  ///< Without these tags the rest could be reached.

    /// Whether there is time for every tag at its period.
    [[nodiscard]] bool reachable() const { return blamed.empty(); }
};

/// What a report is made of.
struct PlanTask {
    std::vector<std::string> names;
    std::vector<poll::TagPlace> places;
    settings::Description description;
    settings::ScannedConfig config;
    poll::CostModel costs;
};

PlanReport reportOn(const PlanTask& task);

/// @return the report for people.
std::string planText(const PlanReport& report);

/// @return the report as one JSON document.
std::string planDocument(const PlanReport& report);

}  // namespace cli
