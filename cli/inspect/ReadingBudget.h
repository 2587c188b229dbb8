// How much of the files that it is given an inspection looks at.
#pragma once

#include <cstddef>

namespace cli {

/// A file may say anything of itself: a million sections that are all the same megabyte, a list
/// that leads back to its beginning. Whatever is read, and every step of a loop over it, is paid
/// for here, so that an inspection ends with every file.
class ReadingBudget {
  public:
    /// Real libraries with all that they need cost a tenth of it.
    explicit ReadingBudget(std::size_t bytes = std::size_t{128} * 1024 * 1024) : left_(bytes) {}

    /// @return false when there is no more; from then on always.
    [[nodiscard]] bool spend(std::size_t bytes) {
        left_ = bytes <= left_ ? left_ - bytes : 0;
        return left_ > 0;
    }

  private:
    std::size_t left_;
};

}  // namespace cli
