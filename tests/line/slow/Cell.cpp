#include "tests/line/slow/Cell.h"

#include <algorithm>
#include <array>
#include <utility>

#include "runtime/ModbusReplies.h"

namespace slow {
namespace {

constexpr int kNode = 1;
constexpr int kUsualBaud = 9600;

constexpr std::array kWorkNames{"read registers", "read mixed",     "read bits",
                                "read longs",     "write",          "write single",
                                "write longs",    "write and back", "write coils"};
static_assert(kWorkNames.size() == std::size(kWorks));
constexpr std::array kHabitNames{"queues", "delays", "drops"};

int characterBits(wire::Mode mode) {
    return wire::standardCharacterBits(mode);
}

NodesOptions nodesOf(const Cell& cell, NodesOptions nodes) {
    nodes.mode = cell.mode;
    nodes.habit = cell.habit;
    nodes.latencyMs = cell.latencyMs;
    nodes.jitterMs = cell.jitterMs;
    nodes.baud = cell.baud;
    nodes.seed = cell.seed;
    constexpr std::uint32_t kItems = 200;
    for (sim::NodeOptions& node : nodes.nodes) {
        node.sizes = {kItems, kItems, kItems, kItems};
        node.longs = sim::LongRange{.count = kItems};
    }
    return nodes;
}

runtime::ExchangeOptions exchangeOf(const Cell& cell, std::vector<std::string>& reports) {
    runtime::ExchangeOptions options;
    options.port = "com1";
    if (cell.knowsReplies) options.rules = std::make_shared<runtime::ModbusReplies>();
    options.frameEnd = cell.frameEnd;
    options.report = [&reports](const std::string& text) { reports.push_back(text); };
    return options;
}

std::string itemsOf(const Cell& cell) {
    const bool single = cell.work == Work::WriteSingle;
    return "model=3 timeout=" + std::to_string(cell.timeoutMs) +
           " repeat=" + std::to_string(cell.repeat) +
           " txMode=" + (cell.mode == wire::Mode::Rtu ? "RTU" : "ASCII") +
           (single ? " presetFunction=6 forceFunction=5" : "");
}

sim::Area areaOf(Items items) {
    constexpr std::array kAreas{sim::Area::Coil, sim::Area::DiscreteInput,
                                sim::Area::HoldingRegister, sim::Area::InputRegister,
                                sim::Area::LongRegister};
    return kAreas.at(static_cast<std::size_t>(items));
}

/// No other access of its kind has written it.
std::uint32_t valueOf(int access) {
    return 0x4000U + static_cast<std::uint32_t>(access);
}

Values bitsOf(int access, int count) {
    Values bits(static_cast<std::size_t>(count));
    const std::uint32_t pattern = 0x9E3779B9U * static_cast<std::uint32_t>(access + 1);
    for (std::size_t i = 0; i < bits.size(); ++i)
        bits[i] = pattern >> i % 32 & 1U;
    return bits;
}

void access(Setting& setting, Work work, int index) {
    switch (work) {
        case Work::ReadRegisters:
            return setting.read(kNode, Items::Holding, index, 1);
        case Work::ReadMixed:
            return setting.read(kNode, index % 3 == 0 ? Items::Registers : Items::Holding, index,
                                1 + index * 5 % 8);
        case Work::ReadBits:
            return setting.read(kNode, Items::Coils, 3 * index, 24);
        case Work::ReadLongs:
            if (index % 2 == 0) return setting.read(kNode, Items::Longs, index, 1);
            return setting.read(kNode, Items::Holding, index, 2);
        case Work::Write:
        case Work::WriteSingle:
            return setting.write(kNode, Items::Holding, index % 5, {valueOf(index)});
        case Work::WriteLongs:
            return setting.write(kNode, Items::Longs, index % 5, {valueOf(index)});
        case Work::WriteOneAndBack:
            if (index % 2 == 0) return setting.write(kNode, Items::Holding, 7, {valueOf(index)});
            return setting.read(kNode, Items::Holding, 7, 1);
        case Work::WriteCoils:
            return setting.write(kNode, Items::Coils, index % 2 * 40, bitsOf(index, 24));
    }
}

}  // namespace

std::string nameOf(Work work, Habit habit) {
    return std::string(kWorkNames.at(static_cast<std::size_t>(work))) + ", " +
           kHabitNames.at(static_cast<std::size_t>(habit));
}

std::string nameOf(const Cell& cell) {
    std::string text = nameOf(cell.work, cell.habit) + ", " + std::to_string(cell.latencyMs);
    if (cell.jitterMs != 0) text += "+-" + std::to_string(cell.jitterMs);
    text += " ms, repeat " + std::to_string(cell.repeat);
    text += cell.mode == wire::Mode::Rtu ? ", RTU" : ", ASCII";
    if (cell.baud != 0) text += ", " + std::to_string(cell.baud) + " baud";
    if (cell.frameEnd == runtime::FrameEndBy::Length) text += ", end by length";
    if (!cell.knowsReplies) text += ", no rules";
    if (cell.pauseMs != 0) text += ", pause " + std::to_string(cell.pauseMs) + " ms";
    if (cell.seed != 1) text += ", seed " + std::to_string(cell.seed);
    return text;
}

Setting::Setting(const Cell& cell, NodesOptions nodes)
    : line_(nodesOf(cell, std::move(nodes))),
      port_(line_, exchangeOf(cell, reports_), cell.baud != 0 ? cell.baud : kUsualBaud,
            characterBits(cell.mode)),
      panel_(port_, itemsOf(cell)),
      start_(line_.now()) {
    for (std::uint16_t coil = 0; coil < 200; ++coil)
        line_.slave().set(kNode, sim::Area::Coil, coil, bitsOf(coil / 32, 32)[coil % 32]);
}

Values Setting::held(int node, Items area, int offset, int count) const {
    const int base = area == Items::Longs ? sim::LongRange{}.base : 0;
    Values values;
    for (int i = 0; i < count; ++i)
        values.push_back(line_.slave().get(static_cast<std::uint8_t>(node), areaOf(area),
                                           static_cast<std::uint32_t>(base + offset + i)));
    return values;
}

void Setting::read(int node, Items area, int offset, int count) {
    const Values before = held(node, area, offset, count);
    const std::size_t changes = line_.changes().size();
    const auto got = panel_.read(node, area, offset, count);
    if (!got) {
        ++tally_.errors;
        return;
    }
    const auto later = line_.changes().begin() + static_cast<std::ptrdiff_t>(changes);
    const bool right =
        *got == before || *got == held(node, area, offset, count) ||
        std::any_of(later, line_.changes().end(), [&](const Change& change) {
            return count == 1 && change.address == offset && change.value == got->front();
        });
    ++(right ? tally_.right : tally_.wrong);
}

void Setting::write(int node, Items area, int offset, const Values& values) {
    if (!panel_.write(node, area, offset, values)) {
        ++tally_.errors;
        return;
    }
    const bool right = held(node, area, offset, static_cast<int>(values.size())) == values;
    ++(right ? tally_.right : tally_.wrong);
}

Tally Setting::tally() const {
    Tally tally = tally_;
    tally.time = std::chrono::duration_cast<Ms>(line_.now() - start_);
    tally.requests = line_.requests();
    return tally;
}

Tally run(const Cell& cell) {
    Setting setting(cell);
    for (int index = 0; index < cell.accesses; ++index) {
        if (cell.pauseMs != 0) setting.line().pass(Ms{cell.pauseMs});
        access(setting, cell.work, index);
    }
    return setting.tally();
}

}  // namespace slow
