// A simulated line with Modbus nodes on a pseudo terminal, with faults on demand.
//
//     sim::Simulator simulator({.mode = wire::Mode::Rtu, .nodes = {{.address = 1}}});
//     simulator.start();
//     openPort(simulator.path());
#pragma once

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <deque>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "sim/Fault.h"
#include "sim/LineEvent.h"
#include "sim/PtyLine.h"
#include "sim/Serving.h"
#include "sim/SimulatorOptions.h"
#include "sim/Slave.h"
#include "wire/Bytes.h"

namespace sim {

/// Serves one line on a thread of its own. Memory, faults and log outlive stop() and start().
/// Threads: start(), stop() and wait() belong to one thread; all else may be called from any.
class Simulator {
  public:
    /// Errors: std::invalid_argument, see Slave; silenceMs 0; a time below 0.
    explicit Simulator(SimulatorOptions options);
    /// Stops.
    ~Simulator();
    Simulator(const Simulator&) = delete;
    Simulator& operator=(const Simulator&) = delete;

    /// Opens the line and serves it; on return a master may open path(). Also after stop() and
    /// after a hang-up, then usually with another device behind the link. Serving already: nothing.
    /// Errors: std::system_error when the pseudo terminal, the link or the thread fails.
    void start();

    /// Ends serving, also in the middle of a reply, and closes the line: the port vanishes.
    void stop();

    /// Asks for the end without waiting for it; wait() returns. Safe in a signal handler. Asked
    /// before start(), serving ends as soon as it begins.
    void requestStop() noexcept;

    using End = sim::End;

    /// Blocks until requestStop() or a hang-up has ended serving, then cleans up as stop() does.
    End wait();

    /// The path that a master opens, also after the end; empty before the first start().
    std::string path() const;
    /// The device itself, /dev/pts/N; empty before the first start().
    std::string device() const;
    wire::Mode mode() const { return options_.mode; }

    /// The nodes: values to look at or to change while serving.
    Slave& slave() { return slave_; }
    const Slave& slave() const { return slave_; }

    /// Faults for the coming requests.
    FaultQueue& faults() { return faults_; }

    /// @return the events so far, oldest first.
    std::vector<LineEvent> log() const;
    void clearLog();
    /// Blocks until log() holds `count` events. @return false when the time ran out first.
    bool waitForEvents(std::size_t count, std::chrono::milliseconds timeout) const;

  private:
    void joinServing();
    void forgetStopRequest();
    void rememberPaths(const PtyLine& line);

    // On the serving thread.
    void serve();
    void record(LineEvent::Kind kind, wire::Bytes raw);

    SimulatorOptions options_;
    Slave slave_;
    FaultQueue faults_;
    posix::FileDescriptor stopEvent_;
    std::unique_ptr<PtyLine> line_;
    std::thread thread_;
    std::atomic<bool> ended_ = false;  // The serving thread has met a stop or a hang-up.
    bool hungUp_ = false;              // It was a hang-up. Others look after the join only.

    mutable std::mutex mutex_;  // Guards what follows.
    mutable std::condition_variable eventAdded_;
    std::string path_;
    std::string device_;
    std::deque<LineEvent> log_;
};

}  // namespace sim
