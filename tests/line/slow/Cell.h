// One cell of the table of slow nodes: what is done, how slow the node is, and what comes of it.
#pragma once

#include <memory>
#include <string>

#include "runtime/LineExchange.h"
#include "tests/line/slow/Panel.h"
#include "tests/line/slow/SlowLine.h"

namespace slow {

/// What the panel does, access for access.
enum class Work : std::uint8_t {
    ReadRegisters,    ///< One holding register each, every time another.
    ReadMixed,        ///< 1 to 8 registers of two areas.
    ReadBits,         ///< 24 coils each.
    ReadLongs,        ///< 32-bit registers, and pairs of plain ones in between.
    Write,            ///< One register each, function 16, every time another value.
    WriteSingle,      ///< The same with function 6.
    WriteLongs,       ///< The same with 32-bit registers.
    WriteOneAndBack,  ///< One and the same register, written and read back in turns.
    WriteCoils,       ///< Blocks of coils, then function 5's single ones.
};

inline constexpr Work kWorks[] = {
    Work::ReadRegisters, Work::ReadMixed,  Work::ReadBits,        Work::ReadLongs,  Work::Write,
    Work::WriteSingle,   Work::WriteLongs, Work::WriteOneAndBack, Work::WriteCoils,
};

struct Cell {
    Work work = Work::ReadRegisters;
    int latencyMs = 10;
    int jitterMs = 0;
    int repeat = 2;
    wire::Mode mode = wire::Mode::Rtu;
    Habit habit = Habit::Queues;
    int baud = 0;  ///< Pace of the characters; 0: they take no time.
    runtime::FrameEndBy frameEnd = runtime::FrameEndBy::Silence;
    bool knowsReplies = true;  ///< Whether the port has rules.
    int timeoutMs = 100;
    int accesses = 40;
    unsigned seed = 1;
    int pauseMs = 0;  ///< Between two accesses.
};

/// "read registers, 120 ms, repeat 2, RTU, queues".
std::string nameOf(const Cell& cell);

/// "read registers, queues".
std::string nameOf(Work work, Habit habit);

/// What became of the accesses.
struct Tally {
    int right = 0;
    int wrong = 0;   ///< Taken as good, and not what the node holds.
    int errors = 0;  ///< Reported as such.
    Ms time{0};
    int requests = 0;
};

/// A line with its nodes, a port and a panel.
class Setting {
  public:
    explicit Setting(const Cell& cell, NodesOptions nodes = {});

    /// Reads items and compares them with what the node held between the beginning and the end.
    void read(int node, Items area, int offset, int count);
    /// Writes items and compares a success with what the node holds then.
    void write(int node, Items area, int offset, const Values& values);

    SlowLine& line() { return line_; }
    Panel& panel() { return panel_; }
    ExchangePort& port() { return port_; }
    /// The time since the line was made.
    Tally tally() const;
    /// What the port reported.
    const std::vector<std::string>& reports() const { return reports_; }

  private:
    Values held(int node, Items area, int offset, int count) const;

    mutable SlowLine line_;
    std::vector<std::string> reports_;
    ExchangePort port_;
    Panel panel_;
    runtime::Line::TimePoint start_;
    Tally tally_;
};

Tally run(const Cell& cell);

}  // namespace slow
