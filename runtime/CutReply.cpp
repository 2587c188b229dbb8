#include "runtime/CutReply.h"

#include <algorithm>

namespace runtime {

void CutReply::keep(ByteView start, std::size_t whole, Line::TimePoint now) {
    const bool isCut = start.size() < whole && whole <= kRoom;
    length_ = isCut ? start.size() : 0;
    lacking_ = isCut ? whole - start.size() : 0;
    std::copy_n(start.begin(), length_, bytes_.begin());
    at_ = now;
}

ByteView CutReply::joined(ByteView rest) {
    if (rest.size() > kRoom - length_) return {};
    std::copy(rest.begin(), rest.end(), bytes_.begin() + static_cast<std::ptrdiff_t>(length_));
    return {bytes_.data(), length_ + rest.size()};
}

}  // namespace runtime
