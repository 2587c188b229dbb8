#include "runtime/LineInput.h"

#include <algorithm>
#include <span>

namespace runtime {

Transfer LineInput::look() {
    const Moved read = line_.read(std::span(bytes_).subspan(count_));
    if (read.gone) return Transfer::Gone;
    if (read.count == 0) return Transfer::TimedOut;
    count_ += read.count;
    lastArrival_ = line_.now();
    return Transfer::Complete;
}

Transfer LineInput::await(Line::TimePoint until) {
    for (;;) {
        const WaitResult wait = line_.waitReadable(until);
        if (wait == WaitResult::Gone) return Transfer::Gone;
        if (wait == WaitResult::TimedOut) return Transfer::TimedOut;
        const Transfer looked = look();
        if (looked != Transfer::TimedOut || line_.now() >= until) return looked;
    }
}

void LineInput::drop(std::size_t count) {
    std::copy(bytes_.begin() + static_cast<std::ptrdiff_t>(count),
              bytes_.begin() + static_cast<std::ptrdiff_t>(count_), bytes_.begin());
    count_ -= count;
}

}  // namespace runtime
