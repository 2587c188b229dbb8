// A serial line with slow Modbus nodes at its far end. Its clock moves only while somebody waits.
#pragma once

#include <chrono>
#include <cstdint>
#include <deque>
#include <limits>
#include <random>
#include <set>
#include <vector>

#include "runtime/Line.h"
#include "sim/Slave.h"
#include "wire/Framing.h"
#include "wire/Times.h"

namespace slow {

using Ms = std::chrono::milliseconds;

/// What the nodes do with a request that comes while another one is not answered yet.
enum class Habit : std::uint8_t {
    Queues,  ///< Serves it when it is its turn, the latency later.
    Delays,  ///< Answers it the latency after its coming, as behind a slow radio or gateway.
    Drops,   ///< Does not notice it.
};

struct NodesOptions {
    wire::Mode mode = wire::Mode::Rtu;
    std::vector<sim::NodeOptions> nodes = {sim::NodeOptions{}};
    Habit habit = Habit::Queues;
    int latencyMs = 10;
    int jitterMs = 0;  ///< The latency differs by at most so much in both directions.
    unsigned seed = 1;
    int baud = 0;  ///< 0: characters take no time.
    /// How often each reply is sent; kForEver: until the next request is served.
    int times = 1;
    int againAfterMs = 20;  ///< From one sending of a reply to the next.

    static constexpr int kForEver = std::numeric_limits<int>::max();
};

/// A register that got a value.
struct Change {
    runtime::Line::TimePoint at;
    std::uint16_t address;
    std::uint32_t value;
};

/// Requests are served, and memory changes, at the moment when the reply begins.
class SlowLine final : public runtime::Line {
  public:
    explicit SlowLine(const NodesOptions& options);

    /// The line lies idle.
    void pass(Ms time) { sleepUntil(now_ + time); }
    /// The node does not serve any more, or serves again. Requests that wait to be served are lost.
    void setDead(std::uint8_t node, bool dead);
    /// The latency from now on, for requests that have not come yet.
    void setLatency(int ms) { options_.latencyMs = ms; }

    std::uint32_t holding(std::uint8_t node, std::uint16_t address) const {
        return slave_.get(node, sim::Area::HoldingRegister, address);
    }
    sim::Slave& slave() { return slave_; }
    /// Every served write of one holding register or of several, in order.
    const std::vector<Change>& changes() const { return changes_; }
    /// Requests that reached the nodes.
    int requests() const { return requests_; }
    /// Waits and sleeps of the user: what it costs in system calls.
    int waits() const { return waits_; }

    TimePoint now() override { return now_; }
    runtime::WaitResult waitReadable(TimePoint until) override;
    runtime::WaitResult waitWritable(TimePoint until) override;
    void sleepUntil(TimePoint until) override;
    runtime::Moved read(std::span<std::uint8_t> buffer) override;
    runtime::Moved write(std::span<const std::uint8_t> data) override;
    std::size_t unsent() override;
    void discardInput() override;
    void discardOutput() override {}

  private:
    struct Arrival {
        TimePoint at;
        std::uint8_t byte;
    };
    /// Something that the nodes are going to do.
    struct Deed {
        TimePoint at;
        wire::Bytes request;  ///< Empty: the reply is sent once more.
        wire::Bytes reply;
        int timesLeft;
    };

    std::chrono::nanoseconds timeOf(std::size_t characters) const;
    Ms nextLatency();
    void accept(const wire::Bytes& request, TimePoint at);
    void schedule(Deed deed);
    void perform(const Deed& deed);
    void serve(const Deed& deed);
    void noteChanges(wire::ByteView request, TimePoint at);
    void transmit(const wire::Bytes& frame, TimePoint from);
    /// Lets the nodes do what is due.
    void catchUp(TimePoint until);
    /// Lets them go on until bytes are on their way, at most until the moment.
    void catchUpToBytes(TimePoint until);
    void countWait();

    NodesOptions options_;
    sim::Slave slave_;
    wire::FrameSplitter splitter_;
    std::mt19937 random_;
    std::set<std::uint8_t> dead_;

    TimePoint now_ = TimePoint{} + std::chrono::hours{1};
    std::deque<Deed> deeds_;        // In the order of their time.
    std::deque<Arrival> arrivals_;  // On their way to this end, or there.
    TimePoint requestsOnWire_ = now_;
    TimePoint repliesOnWire_ = now_;
    TimePoint busyUntil_ = now_;
    std::vector<Change> changes_;
    int requests_ = 0;
    int waits_ = 0;
};

}  // namespace slow
