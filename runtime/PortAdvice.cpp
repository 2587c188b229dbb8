#include "runtime/PortAdvice.h"

#include <algorithm>

namespace runtime {
namespace {

using std::chrono::milliseconds;

std::string ms(milliseconds time) {
    return std::to_string(time.count()) + " ms";
}

/// The smallest multiple of `step` that is half as long again as `time`.
milliseconds withMargin(milliseconds time, milliseconds step) {
    const auto steps = (time.count() * 3 / 2 + step.count()) / step.count();
    return step * steps;
}

}  // namespace

std::string lateAdvice(const std::string& port, const LateNode& node) {
    const auto turnaround = std::chrono::ceil<milliseconds>(node.turnaround);
    const auto timeout = std::chrono::ceil<milliseconds>(node.timeout);
    return port + ": node " + std::to_string(node.node) + " answers up to " + ms(turnaround) +
           " after a request, and the timeout is " + ms(timeout) + ": set the timeout to " +
           ms(withMargin(turnaround, milliseconds{50}));
}

std::string cutAdvice(const std::string& port, milliseconds gap, std::chrono::nanoseconds pause) {
    const auto paused = std::max(std::chrono::ceil<milliseconds>(pause), gap);
    return port + ": a reply paused for " + ms(paused) + ", longer than the gap of " + ms(gap) +
           ", and was cut: --min-gap " +
           std::to_string(withMargin(paused, milliseconds{10}).count()) +
           " or --frame-end length keeps it whole";
}

}  // namespace runtime
