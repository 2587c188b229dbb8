// Cuts a run of items into blocks that one request can carry. Pure.
#pragma once

#include <algorithm>

/// A range of blocks for a range-based `for`: each block holds `limit` items, the last one the
/// rest. Together they hold items 0..count - 1, each once and in order. A count below 1 gives no
/// block; a limit below 1 counts as 1, so that the walk always ends.
class Blocks {
  public:
    struct Block {
        int first;  ///< Items in front of this block.
        int count;  ///< Items of this block, 1..limit.

        bool operator==(const Block&) const = default;
    };

    class Iterator {
      public:
        Iterator(int first, int count, int limit) : first_(first), count_(count), limit_(limit) {}
        Block operator*() const { return {first_, step()}; }
        Iterator& operator++() {
            first_ += step();
            return *this;
        }
        bool operator==(const Iterator& other) const { return first_ == other.first_; }

      private:
        int step() const { return std::min(limit_, count_ - first_); }

        int first_;
        int count_;
        int limit_;
    };

    Blocks(int count, int limit) : count_(std::max(count, 0)), limit_(std::max(limit, 1)) {}

    Iterator begin() const { return {0, count_, limit_}; }
    Iterator end() const { return {count_, count_, limit_}; }

  private:
    int count_;
    int limit_;
};
