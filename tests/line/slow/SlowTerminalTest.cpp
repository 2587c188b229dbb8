// The same as the simulated line tells, on a real pseudo terminal with a slave that takes its time.
#include <gtest/gtest.h>

#include <atomic>
#include <deque>
#include <thread>

#include "runtime/ModbusReplies.h"
#include "sim/Slave.h"
#include "tests/line/PseudoTerminal.h"
#include "tests/line/slow/Panel.h"
#include "wire/Framing.h"

namespace slow {
namespace {

using Clock = std::chrono::steady_clock;

/// Answers every request in turn, each a fixed time after its coming or after the reply before.
class SlowSlave {
  public:
    SlowSlave(const PseudoTerminal& terminal, std::chrono::milliseconds latency)
        : terminal_(terminal), latency_(latency), thread_([this] { serve(); }) {}
    ~SlowSlave() {
        stopped_ = true;
        thread_.join();
    }
    SlowSlave(const SlowSlave&) = delete;
    SlowSlave& operator=(const SlowSlave&) = delete;

    std::uint32_t holding(std::uint32_t address) const {
        return slave_.get(1, sim::Area::HoldingRegister, address);
    }

  private:
    struct Due {
        Clock::time_point at;
        wire::Bytes reply;
    };

    void serve() {
        while (!stopped_) {
            if (arrives()) take();
            if (queue_.empty() || queue_.front().at > Clock::now()) continue;
            terminal_.put(queue_.front().reply);
            queue_.pop_front();
        }
    }

    /// Waits until something is to be done, or somebody may have stopped this.
    bool arrives() const {
        int waitMs = 20;
        if (!queue_.empty()) {
            const auto left =
                std::chrono::ceil<std::chrono::milliseconds>(queue_.front().at - Clock::now());
            waitMs = static_cast<int>(std::clamp<long long>(left.count(), 0, waitMs));
        }
        pollfd watched{terminal_.far(), POLLIN, 0};
        return ::poll(&watched, 1, waitMs) > 0;
    }

    void take() {
        std::array<std::uint8_t, 256> bytes{};
        const ssize_t count = ::read(terminal_.far(), bytes.data(), bytes.size());
        if (count <= 0) return;
        const wire::ByteView came = wire::ByteView(bytes).first(static_cast<std::size_t>(count));
        for (const wire::Received& request : splitter_.add(came)) {
            const auto reply = slave_.answer(request.message);
            if (!reply) continue;
            busyUntil_ = std::max(busyUntil_, Clock::now()) + latency_;
            queue_.push_back({busyUntil_, wire::encodeFrame(wire::Mode::Rtu, *reply)});
        }
    }

    const PseudoTerminal& terminal_;
    const std::chrono::milliseconds latency_;
    sim::Slave slave_{{{.address = 1}}};
    wire::FrameSplitter splitter_{
        wire::Mode::Rtu, [this](wire::ByteView bytes) { return slave_.requestLength(bytes); }};
    std::deque<Due> queue_;
    Clock::time_point busyUntil_{};
    std::atomic<bool> stopped_ = false;
    std::thread thread_;
};

struct Found {
    int right = 0;
    int wrong = 0;
    int errors = 0;
};

struct SlowTerminalTest : LineTest {
    /// Reads registers, every time another, with the driver's usual three attempts of 100 ms.
    Found readFrom(std::chrono::milliseconds latency, int registers) {
        Found found;
        ISerialPort* const port = openPort();
        const SlowSlave slave(terminal, latency);
        {
            Panel panel(*port, "timeout=100 repeat=2");
            for (int i = 0; i < registers; ++i) {
                const auto values = panel.read(1, Items::Holding, i, 1);
                const bool right =
                    values && values->front() == slave.holding(static_cast<std::uint32_t>(i));
                ++(!values ? found.errors : right ? found.right : found.wrong);
            }
        }
        factory.releasePort(port);
        return found;
    }
};

TEST_F(SlowTerminalTest, LateRepliesAreNobodyElsesValue) {
    factory.setReplyRules(std::make_shared<runtime::ModbusReplies>());
    for (const auto& [latencyMs, registers] : {std::pair{50, 40}, {120, 40}, {250, 10}}) {
        const Found found = readFrom(std::chrono::milliseconds{latencyMs}, registers);
        EXPECT_EQ(0, found.wrong) << latencyMs;
        EXPECT_LT(0, found.right) << latencyMs;
    }
}

TEST_F(SlowTerminalTest, WithoutRulesTheyAre) {
    EXPECT_LT(0, readFrom(std::chrono::milliseconds{120}, 10).wrong);
}

}  // namespace
}  // namespace slow
