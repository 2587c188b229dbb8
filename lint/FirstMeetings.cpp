#include "lint/FirstMeetings.h"

#include <algorithm>
#include <functional>
#include <limits>
#include <numeric>

namespace lint {
namespace {

/// The two first places of two different kinds: one of them answers every seeker.
class FirstTwo {
  public:
    void take(std::size_t place, int kind) {
        if (place < first_.place) {
            if (kind != first_.kind) second_ = first_;
            first_ = {place, kind};
        } else if (kind != first_.kind && place < second_.place) {
            second_ = {place, kind};
        }
    }
    void take(const FirstTwo& other) {
        take(other.first_.place, other.first_.kind);
        take(other.second_.place, other.second_.kind);
    }
    [[nodiscard]] std::optional<std::size_t> otherThan(int kind) const {
        const Entry& entry = first_.kind == kind ? second_ : first_;
        if (entry.place == kNowhere) return std::nullopt;
        return entry.place;
    }

  private:
    static constexpr std::size_t kNowhere = std::numeric_limits<std::size_t>::max();
    struct Entry {
        std::size_t place = kNowhere;
        int kind = kNoKind;
    };
    Entry first_;
    Entry second_;
};

/// What was put in, found by how far it reaches: a binary indexed tree over the ends, the farthest
/// first.
class Reach {
  public:
    explicit Reach(const std::vector<Stretch>& stretches) {
        for (const Stretch& each : stretches)
            ends_.push_back(each.end);
        std::sort(ends_.begin(), ends_.end(), std::greater<>());
        ends_.erase(std::unique(ends_.begin(), ends_.end()), ends_.end());
        tree_.resize(ends_.size() + 1);
    }

    void put(const Stretch& stretch, std::size_t place) {
        for (std::size_t node = countBeyond(stretch.end) + 1; node < tree_.size();
             node += lowestBit(node))
            tree_[node].take(place, stretch.kind);
    }

    /// @return the first of those that end behind `point`.
    [[nodiscard]] FirstTwo beyond(long long point) const {
        FirstTwo found;
        for (std::size_t node = countBeyond(point); node > 0; node -= lowestBit(node))
            found.take(tree_[node]);
        return found;
    }

  private:
    static std::size_t lowestBit(std::size_t node) { return node & (~node + 1); }

    [[nodiscard]] std::size_t countBeyond(long long point) const {
        const auto end = std::lower_bound(ends_.begin(), ends_.end(), point, std::greater<>());
        return static_cast<std::size_t>(end - ends_.begin());
    }

    std::vector<long long> ends_;
    std::vector<FirstTwo> tree_;  ///< Node 0 is not used.
};

std::vector<std::size_t> placesBy(const std::vector<Stretch>& stretches, long long Stretch::*key) {
    std::vector<std::size_t> places(stretches.size());
    std::iota(places.begin(), places.end(), std::size_t{0});
    std::sort(places.begin(), places.end(),
              [&](std::size_t a, std::size_t b) { return stretches[a].*key < stretches[b].*key; });
    return places;
}

}  // namespace

std::vector<std::optional<std::size_t>> firstMeetings(const std::vector<Stretch>& seekers,
                                                      const std::vector<Stretch>& others) {
    std::vector<std::optional<std::size_t>> met(seekers.size());
    const std::vector<std::size_t> waiting = placesBy(others, &Stretch::begin);
    auto next = waiting.begin();
    Reach begun(others);
    // Others that begin behind a seeker's end come in after it has looked.
    for (const std::size_t each : placesBy(seekers, &Stretch::end)) {
        const Stretch& seeker = seekers[each];
        for (; next != waiting.end() && others[*next].begin < seeker.end; ++next)
            begun.put(others[*next], *next);
        met[each] = begun.beyond(seeker.begin).otherThan(seeker.kind);
    }
    return met;
}

}  // namespace lint
