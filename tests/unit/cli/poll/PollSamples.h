// Tags and states for the tests of what is shown of them.
#pragma once

#include <chrono>

#include "cli/poll/ShownTags.h"

namespace cli_test {

/// 2026-03-01T12:00:00Z.
inline std::chrono::system_clock::time_point noon() {
    return std::chrono::sys_days{std::chrono::year{2026} / 3 / 1} + std::chrono::hours(12);
}

/// A scaled number, a boolean and a text.
inline cli::ShownTags sampleTags() {
    poll::ListedTag level{.name = "Level", .uri = "1?HREG?400001?unsignedShort"};
    level.scale = 0.1;
    level.decimals = 1;
    level.unit = "m, \"NN\"";
    return cli::ShownTags(
        {level, {.name = "Pump", .uri = "1?OUTP?1?boolean"}, {.name = "Text", .uri = "x"}},
        {{ICU_Type::unsignedShort, 2}, {ICU_Type::boolean, 1}, {ICU_Type::string, 4}});
}

inline poll::TagState goodState(std::vector<std::uint8_t> value, std::uint64_t count = 1) {
    poll::TagState state;
    state.quality = poll::Quality::Good;
    state.value = std::move(value);
    state.at = noon() - std::chrono::milliseconds(1750);
    state.count = count;
    return state;
}

inline poll::Snapshot sampleSnapshot() {
    poll::Snapshot snapshot;
    snapshot.tags = {goodState({0x39, 0x05}), goodState({1}), {}};
    snapshot.tags[2].quality = poll::Quality::Bad;
    snapshot.tags[2].error = {-6, "exception 2, \"illegal\""};
    snapshot.nodes = {{.node = 1}};
    snapshot.line.open = true;
    return snapshot;
}

}  // namespace cli_test
