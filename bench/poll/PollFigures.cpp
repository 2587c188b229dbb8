// What polling a list of tags by a plan costs, as one table.
//
//   poll_figures PLUGIN CYCLES    so many cycles of each plan on the paced line, in turns
//
// The line is simulated, 19,200 baud with 11 bits a character; its characters take their time.
#include <fmt/format.h>
#include <malloc.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>
#include <vector>

#include "bench/poll/MixedTags.h"
#include "bench/poll/PacedLine.h"
#include "poll/BlockReader.h"
#include "poll/Plan.h"
#include "poll/Rivals.h"
#include "poll/TagPlacing.h"
#include "settings/DescriptionBlock.h"
#include "tests/unit/poll/SlavePort.h"

namespace {

using Blocks = std::vector<poll::Block>;
using Milliseconds = std::chrono::duration<double, std::milli>;
using std::chrono::steady_clock;

void row(const std::string& figure, const std::string& value, const std::string& wanted = "") {
    fmt::print("| {} | {} | {} |\n", figure, value, wanted);
    std::fflush(stdout);
}

std::string text(std::chrono::nanoseconds time) {
    return fmt::format("{:.0f} ms", Milliseconds(time).count());
}

double ratio(std::chrono::nanoseconds a, std::chrono::nanoseconds b) {
    return Milliseconds(a).count() / Milliseconds(b).count();
}

poll::CostModel costsWith(std::chrono::nanoseconds gapAfterReply) {
    poll::CostModel costs;
    costs.rate = bench::kRate;
    costs.gapAfterReply = gapAfterReply;
    return costs;
}

std::vector<poll::TagPlace> placesOf(runtime::Channel& channel,
                                     const std::vector<const ITag*>& tags) {
    const auto description =
        settings::parseDescription(settings::inflateDescription(channel.protocol().GetXml()));
    std::vector<poll::TagPlace> places;
    places.reserve(tags.size());
    for (const ITag* tag : tags)
        places.push_back(poll::placeOf(*tag, channel, description).value());
    return places;
}

/// Time of the whole plan, one read of every block.
std::chrono::nanoseconds cycleOf(const Blocks& blocks) {
    std::chrono::nanoseconds sum{0};
    for (const poll::Block& block : blocks)
        sum += block.cost;
    return sum;
}

/// One read of every block. Errors: std::runtime_error when a tag has no value.
std::chrono::nanoseconds cycle(poll::BlockSource& source, const Blocks& blocks) {
    const auto begin = steady_clock::now();
    for (const poll::Block& block : blocks)
        for (const poll::TagReading& reading : source.read(block))
            if (!reading.good) throw std::runtime_error(reading.error.text);
    return steady_clock::now() - begin;
}

std::chrono::nanoseconds median(std::vector<std::chrono::nanoseconds> times) {
    std::sort(times.begin(), times.end());
    return times[times.size() / 2];
}

/// A plan with a name, and what it took.
struct Contender {
    std::string name;
    Blocks blocks;
    std::vector<std::chrono::nanoseconds> times{};
};

/// @return the plan, then the fixed gaps, the best of them in front.
std::vector<Contender> contenders(const std::vector<poll::TagPlace>& places,
                                  const poll::CostModel& costs) {
    std::vector<Contender> plans{{"plan", poll::makePlan(places, {}, costs).blocks}};
    for (const long gap : poll::kFixedGaps)
        plans.push_back({fmt::format("fixed gap {}", gap),
                         poll::planOfFixedGap(places, gap, {}, costs).blocks});
    std::sort(plans.begin() + 1, plans.end(), [](const Contender& a, const Contender& b) {
        return cycleOf(a.blocks) < cycleOf(b.blocks);
    });
    return plans;
}

void paced(const std::string& plugin, int cycles, runtime::FrameEndBy frameEnd,
           std::chrono::milliseconds gap, const std::string& by) {
    bench::PacedLine line(plugin, 4, frameEnd);
    const auto tags = line.tags(bench::mixedTags({}));
    poll::ChannelSource source(line.channel(), tags);
    const auto places = placesOf(line.channel(), tags);
    const auto costs = costsWith(gap);
    auto plans = contenders(places, costs);
    const auto single = poll::planOfSingles(places, {}, costs).blocks;
    plans.erase(plans.begin() + 2, plans.end());
    for (int done = 0; done < cycles; ++done)
        for (Contender& plan : plans)
            plan.times.push_back(cycle(source, plan.blocks));
    const auto predicted = cycleOf(plans[0].blocks);
    const auto measured = median(plans[0].times);
    row("1,000 tags, 4 nodes, " + by + ": cycle measured / predicted",
        fmt::format("{} / {} = {:.3f}", text(measured), text(predicted),
                    ratio(measured, predicted)),
        "0.9 .. 1.1");
    row("- requests, one a tag / plan",
        fmt::format(
            "{} / {} = {:.1f}", single.size(), plans[0].blocks.size(),
            static_cast<double>(single.size()) / static_cast<double>(plans[0].blocks.size())),
        "5 or more");
    row("- predicted, one a tag / plan",
        fmt::format("{} / {} = {:.1f}", text(cycleOf(single)), text(predicted),
                    ratio(cycleOf(single), predicted)));
    row("- measured, best fixed gap / plan",
        fmt::format("{} ({}) / {} = {:.3f}", text(median(plans[1].times)), plans[1].name,
                    text(measured), ratio(median(plans[1].times), measured)),
        "1 or more");
}

void oneNode(const std::string& plugin) {
    bench::PacedLine line(plugin, 1, runtime::FrameEndBy::Length);
    const auto tags = line.tags(bench::mixedTags({.nodes = 1, .span = 2400}));
    const auto places = placesOf(line.channel(), tags);
    const auto costs = costsWith({});
    const auto plans = contenders(places, costs);
    const auto show = [&](const std::string& name, const Blocks& blocks) {
        row("- " + name, fmt::format("{} requests, {}", blocks.size(), text(cycleOf(blocks))));
    };
    row("1,000 tags, 1 node, spread wide, predicted:", "");
    show("one request a tag", poll::planOfSingles(places, {}, costs).blocks);
    show("fewest requests", poll::planOfFixedGap(places, 100000, {}, costs).blocks);
    for (const Contender& plan : plans)
        show(plan.name, plan.blocks);
}

std::size_t heap() {
    return mallinfo2().uordblks;
}

/// The loaded plug-in on slaves that answer at once.
void memory(const std::string& plugin, int cycles) {
    sim::Slave slave({{.address = 1}, {.address = 2}, {.address = 3}, {.address = 4}});
    poll_test::SlavePort port(slave);
    runtime::PosixMultiTask multiTask;
    runtime::ServiceFactory services(multiTask, port);
    const auto library = bench::valueOf(runtime::PluginLibrary::load(plugin));
    const auto module = bench::valueOf(runtime::Module::bind(library, services));
    runtime::Channel channel(bench::valueOf(module.createProtocol("MRTU")));
    bench::valueOf(
        channel.configure("CfgVer=1 defNodeId=1 uart=com1 baudrate=19200 parity=even "
                          "bits=8 stopbits=1 mode=RS-232 txMode=RTU repeat=0"));
    bench::valueOf(channel.start());

    const auto uris = bench::mixedTags({});
    const std::size_t before = heap();
    std::vector<const ITag*> tags;
    tags.reserve(uris.size());
    for (const std::string& uri : uris)
        tags.push_back(bench::valueOf(channel.createTag(uri)));
    const std::size_t withTags = heap();
    const auto places = placesOf(channel, tags);
    const auto blocks = poll::makePlan(places, {}, costsWith({})).blocks;
    poll::ChannelSource source(channel, tags);
    cycle(source, blocks);
    const std::size_t withPlan = heap();
    row("bytes of heap per polled tag: driver's tag + plan",
        fmt::format("{} + {}", (withTags - before) / uris.size(),
                    (withPlan - withTags) / uris.size()));

    const auto few = poll::makePlan(std::span(places).first(20), {}, costsWith({})).blocks;
    cycle(source, few);
    const std::size_t atStart = heap();
    for (int done = 0; done < cycles; ++done)
        cycle(source, few);
    row(fmt::format("growth over {} cycles of 20 tags without time, bytes", cycles),
        fmt::format("{}", static_cast<long>(heap()) - static_cast<long>(atStart)), "0");
}

}  // namespace

int main(int count, char** arguments) {
    if (count != 3) return std::fputs("usage: poll_figures PLUGIN CYCLES\n", stderr), 2;
    const std::string plugin = arguments[1];
    const int cycles = std::max(1, std::atoi(arguments[2]));
    try {
        fmt::print("| figure | value | wanted |\n|---|---|---|\n");
        paced(plugin, cycles, runtime::FrameEndBy::Length, {}, "length ends a reply");
        paced(plugin, cycles, runtime::FrameEndBy::Silence, std::chrono::milliseconds(7),
              "silence ends a reply");
        oneNode(plugin);
        memory(plugin, 100000);
    } catch (const std::exception& error) {
        return std::fprintf(stderr, "poll_figures: %s\n", error.what()), 1;
    }
    return 0;
}
