#include "poll/LeastTime.h"

#include <algorithm>
#include <cstdint>
#include <limits>

namespace poll {
namespace {

struct Beginning {
    std::size_t at;
    long first;
    std::int64_t key;  ///< Cost of what lies in front, less the units in front of it.
};

/// Beginnings with one place inside a unit, the best in front; each is worse than those in front of
/// it and better than none once those are out of reach.
class Beginnings {
  public:
    void add(const Beginning& more) {
        while (head_ < queue_.size() && queue_.back().key > more.key)
            queue_.pop_back();
        queue_.push_back(more);
    }
    void dropInFrontOf(long first) {
        while (head_ < queue_.size() && queue_[head_].first < first)
            ++head_;
    }
    [[nodiscard]] const Beginning* best() const {
        return head_ < queue_.size() ? &queue_[head_] : nullptr;
    }

  private:
    std::vector<Beginning> queue_;
    std::size_t head_ = 0;
};

struct Choice {
    std::int64_t cost = std::numeric_limits<std::int64_t>::max();
    std::size_t begin = 0;
};

/// @return the best beginning of the read that ends with an extent.
Choice choose(std::vector<Beginnings>& byPlace, const Extent& last, const ReadCost& cost,
              long most) {
    Choice choice;
    for (std::size_t place = 0; place < byPlace.size(); ++place) {
        byPlace[place].dropInFrontOf(last.end - most);
        const Beginning* best = byPlace[place].best();
        if (best == nullptr) continue;
        const long units = cost.unitsOf(last.end - static_cast<long>(place));
        const std::int64_t total = best->key + (cost.request + cost.unit * units).count();
        if (total < choice.cost || (total == choice.cost && best->at < choice.begin))
            choice = {total, best->at};
    }
    return choice;
}

}  // namespace

std::vector<std::size_t> leastTime(std::span<const Extent> extents, const ReadCost& cost,
                                   long most) {
    std::vector<Beginnings> byPlace(static_cast<std::size_t>(cost.itemsInUnit));
    std::vector<Choice> choices(extents.size());
    std::int64_t before = 0;
    for (std::size_t at = 0; at < extents.size(); ++at) {
        const long first = extents[at].first;
        const long unitsInFront = first / cost.itemsInUnit;
        byPlace[static_cast<std::size_t>(first % cost.itemsInUnit)].add(
            {at, first, before - (cost.unit * unitsInFront).count()});
        choices[at] = choose(byPlace, extents[at], cost, most);
        before = choices[at].cost;
    }
    std::vector<std::size_t> begins;
    for (std::size_t end = extents.size(); end > 0; end = choices[end - 1].begin)
        begins.push_back(choices[end - 1].begin);
    std::reverse(begins.begin(), begins.end());
    return begins;
}

}  // namespace poll
