// A caller's text buffer between two guards.
#pragma once

#include <algorithm>
#include <string>
#include <vector>

/// Hands out a buffer of `size` bytes, which may be 0 or negative, and remembers every byte in
/// front of it and behind it.
class GuardedText {
  public:
    static constexpr char kFill = '\x5A';

    explicit GuardedText(int size)
        : inside_(static_cast<std::size_t>(std::max(size, 0))),
          bytes_(kGuard + inside_ + kGuard, kFill) {}

    char* out() { return bytes_.data() + kGuard; }

    /// All bytes of the buffer, zeroes included.
    std::string content() const {
        return std::string(bytes_.data() + kGuard, bytes_.data() + kGuard + inside_);
    }
    /// What a caller that trusts the terminating zero sees.
    std::string text() const {
        const std::string all = content();
        return all.substr(0, all.find('\0'));
    }
    bool guardsIntact() const {
        const auto isFill = [](char byte) { return byte == kFill; };
        return std::all_of(bytes_.begin(), bytes_.begin() + kGuard, isFill) &&
               std::all_of(bytes_.end() - kGuard, bytes_.end(), isFill);
    }
    bool untouched() const {
        return std::all_of(bytes_.begin(), bytes_.end(), [](char b) { return b == kFill; });
    }

  private:
    static constexpr std::ptrdiff_t kGuard = 512;

    std::size_t inside_;
    std::vector<char> bytes_;
};
