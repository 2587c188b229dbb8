#include "framework/TagList.h"

void TagList::add(ITag* tag) {
    // First into a list of its own: what throws here throws before anything has changed.
    std::list<ITag*> entry(1, tag);
    places_.emplace(tag, entry.cbegin());
    tags_.splice(tags_.end(), entry);
}

void TagList::remove(const ITag* tag) noexcept {
    const auto [first, last] = places_.equal_range(tag);
    for (auto place = first; place != last; ++place)
        tags_.erase(place->second);
    places_.erase(first, last);
}

void TagList::clear() noexcept {
    places_.clear();
    tags_.clear();
}
