// What a port tells people, in words. Pure.
#pragma once

#include <chrono>
#include <string>

#include "runtime/OwedReplies.h"

namespace runtime {

/// @return "com1: node 3 answers up to 250 ms after a request, and the timeout is 100 ms: set the
/// timeout to 400 ms". The timeout is half as long again as the turnaround, in steps of 50 ms.
std::string lateAdvice(const std::string& port, const LateNode& node);

/// @return "com1: a reply paused for 18 ms, longer than the gap of 13 ms, and was cut: --min-gap 30
/// or --frame-end length keeps it whole".
std::string cutAdvice(const std::string& port, std::chrono::milliseconds gap,
                      std::chrono::nanoseconds pause);

}  // namespace runtime
