// Memory that can be made to run short, for the whole process: the program's own malloc() stands in
// front of the C library's, and so in front of every loaded library's, whichever operator new that
// library carries inside. Under a sanitizer, which has a malloc() of its own, operator new is
// replaced instead.
//
// One thread: the counters are plain numbers.
#pragma once

#include <cstddef>

namespace shortage {

/// What follows the refused request.
enum class Kind {
    once,     ///< Later requests are granted.
    lasting,  ///< Later requests are refused too.
};

/// While it lives the request with the number `nth`, counted from 1, is refused. One at a time.
class Refusal {
  public:
    Refusal(long nth, Kind kind);
    ~Refusal();
    Refusal(const Refusal&) = delete;
    Refusal& operator=(const Refusal&) = delete;

    /// How many requests were refused.
    static long refused();
};

/// While it lives everything is granted and nothing counted: the host's own needs are not the
/// subject.
class Plenty {
  public:
    Plenty();
    ~Plenty();
    Plenty(const Plenty&) = delete;
    Plenty& operator=(const Plenty&) = delete;
};

/// Blocks that were handed out and not yet given back.
long blocksAlive();

/// The largest request since the last forgetLargest(), in bytes.
std::size_t largestRequest();
void forgetLargest();

}  // namespace shortage
