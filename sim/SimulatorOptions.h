// What a simulated line is like.
#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "sim/LineEvent.h"
#include "sim/Slave.h"
#include "wire/Bytes.h"
#include "wire/Times.h"

namespace sim {

struct SimulatorOptions {
    wire::Mode mode = wire::Mode::Rtu;
    std::vector<NodeOptions> nodes = {NodeOptions{}};
    /// Set: characters take their time in both directions, and an RTU slave keeps 3.5 characters of
    /// silence before it replies, or its turnaround where that is longer. 0 baud: nothing takes
    /// time but turnarounds.
    wire::LineRate rate = {.baud = 0};
    /// A node loses what comes while it is still at work on another request. Else it comes to that
    /// later, as a slave with a buffer does.
    bool losesWhileBusy = false;
    std::uint64_t seed = 1;        ///< Of the turnarounds' jitter.
    std::string link{};            ///< Symbolic link to the device, see PtyLine. Empty: none.
    std::uint32_t silenceMs = 20;  ///< Silence that ends an RTU frame of no announced length, 1..
    std::size_t logLimit = 10000;  ///< Events that log() keeps; older ones are dropped.
    /// Called for each event on the serving thread, before it has any effect. It must not throw and
    /// not call start(), stop() or wait().
    std::function<void(const LineEvent&)> trace{};
};

}  // namespace sim
