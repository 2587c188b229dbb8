#include "poll/ValueStore.h"

namespace poll {

namespace {

void takeGood(TagState& state, const TagReading& reading, ValueStore::WallTime at) {
    state.quality = Quality::Good;
    state.value.assign(reading.value.begin(), reading.value.end());
    state.at = at;
    state.error = {};
    state.staleSince.reset();
    ++state.count;
}

void takeBad(TagState& state, const ReadError& error) {
    state.quality = Quality::Bad;
    state.error = error;
    state.staleSince.reset();
}

// Since when counts from the first failure.
void takeLost(TagState& state, const ReadError& error, ValueStore::WallTime at) {
    state.error = error;
    if (state.count == 0) {
        state.quality = Quality::Never;
        return;
    }
    state.quality = Quality::Stale;
    if (!state.staleSince) state.staleSince = at;
}

}  // namespace

ValueStore::ValueStore(std::size_t tags, std::span<const Block> blocks)
    : homes_(tags, Home{blocks.size(), 0}) {
    for (const Block& block : blocks) {
        for (std::size_t at = 0; at < block.tags.size(); ++at)
            homes_[block.tags[at]] = {groups_.size(), at};
        groups_.push_back(std::make_shared<States>(block.tags.size()));
    }
    groups_.push_back(std::make_shared<States>(1));
}

void ValueStore::adopt(const KnownTags& known) {
    for (const auto& [tag, state] : known)
        if (homes_[tag].block + 1 < groups_.size())
            (*groups_[homes_[tag].block])[homes_[tag].at] = state;
}

// References are taken and let go under the lock alone, so the count is certain.
ValueStore::States& ValueStore::writable(std::size_t block) {
    std::shared_ptr<States>& group = groups_[block];
    if (group.use_count() > 1) group = std::make_shared<States>(*group);
    return *group;
}

void ValueStore::take(std::size_t block, std::span<const std::size_t> tags,
                      std::span<const TagReading> readings, bool heard, WallTime at) {
    const std::lock_guard lock(mutex_);
    States& states = writable(block);
    for (std::size_t i = 0; i < tags.size() && i < readings.size(); ++i) {
        TagState& tag = state(states, tags[i]);
        if (readings[i].good)
            takeGood(tag, readings[i], at);
        else if (heard)
            takeBad(tag, readings[i].error);
        else
            takeLost(tag, readings[i].error, at);
    }
}

void ValueStore::lose(std::size_t block, const ReadError& error, WallTime at) {
    const std::lock_guard lock(mutex_);
    for (TagState& tag : writable(block))
        takeLost(tag, error, at);
}

std::vector<TagState> ValueStore::tags() const {
    std::vector<std::shared_ptr<States>> seen;
    {
        const std::lock_guard lock(mutex_);
        seen = groups_;
    }
    std::vector<TagState> all;
    all.reserve(homes_.size());
    for (const Home& home : homes_)
        all.push_back((*seen[home.block])[home.at]);
    const std::lock_guard lock(mutex_);
    seen.clear();
    return all;
}

}  // namespace poll
