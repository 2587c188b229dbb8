// What a configuration and its tags cost: the time for one of them must not grow with their number.
//
// Read the times for different numbers against each other; "items_per_second" counts nodes or tags.
#include <benchmark/benchmark.h>

#include <string>
#include <vector>

#include "mrtu/Protocol_MRTU.h"

namespace {

/// Every node with the ten keys that a node can have.
std::string configuration(int nodes) {
    std::string text =
        "CfgVer=1 defNodeId=1 uart=com1 baudrate=19200 parity=none bits=8 stopbits=1 mode=RS-485";
    for (int node = 1; node <= nodes; ++node) {
        const std::string prefix = " Node" + std::to_string(node) + "::";
        for (const char* item :
             {"prefix=boiler", "defNodeId=1", "timeout=500", "delay=5", "repeat=1", "maxOptLen=200",
              "maxBitOptLen=1000", "presetFunction=16", "forceFunction=15", "model=1"})
            text += prefix + item;
    }
    return text;
}

void configure(benchmark::State& state) {
    const std::string text = configuration(static_cast<int>(state.range(0)));
    Protocol_MRTU driver;
    for (auto _ : state)
        if (driver.Config(text.c_str()) == 0) return state.SkipWithError("refused");
    state.SetItemsProcessed(state.iterations() * state.range(0));
    state.SetComplexityN(state.range(0));
}
BENCHMARK(configure)->Arg(247)->Arg(4000)->Arg(40000)->Unit(benchmark::kMillisecond)->Complexity();

/// Tags of as many nodes, freed in the order in which they were made.
void createAndFreeTags(benchmark::State& state) {
    const auto count = static_cast<std::size_t>(state.range(0));
    Protocol_MRTU driver;
    if (driver.Config(configuration(static_cast<int>(count)).c_str()) == 0)
        return state.SkipWithError("refused");
    std::vector<std::string> uris;
    for (std::size_t i = 1; i <= count; ++i)
        uris.push_back(std::to_string(i) + "?HREG?400001?short");
    std::vector<ITag*> tags(count);
    for (auto _ : state) {
        for (std::size_t i = 0; i < count; ++i)
            tags[i] = driver.CreateTag(uris[i].c_str());
        for (ITag* tag : tags)
            driver.FreeTag(tag);
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
    state.SetComplexityN(state.range(0));
}
BENCHMARK(createAndFreeTags)
    ->Arg(250)
    ->Arg(4000)
    ->Arg(40000)
    ->Unit(benchmark::kMillisecond)
    ->Complexity();

}  // namespace

BENCHMARK_MAIN();
