#include "engine/WriteTurns.h"

namespace engine {

WriteTurns::Turn::Turn(WriteTurns& turns, const WritePlace& place, Kind kind)
    : turns_(turns), place_(place), kind_(kind) {
    if (kind_ == Kind::Free) return;
    turns_.enlist(*this);
    granted_.wait(0);
}

WriteTurns::Turn::~Turn() {
    if (kind_ != Kind::Free) turns_.strike(*this);
}

void WriteTurns::enlist(Turn& turn) {
    const std::lock_guard lock(mutex_);
    Turn** end = &first_;
    while (*end != nullptr)
        end = &(*end)->next_;
    *end = &turn;
    if (mayHave(turn)) turn.granted_ = 1;
}

/// The waiting are woken under the lock, which each of them needs before its turn can go away.
void WriteTurns::strike(const Turn& turn) {
    const std::lock_guard lock(mutex_);
    Turn** at = &first_;
    while (*at != &turn)
        at = &(*at)->next_;
    *at = turn.next_;
    for (Turn* other = first_; other != nullptr; other = other->next_) {
        if (other->granted_ != 0 || !mayHave(*other)) continue;
        other->granted_ = 1;
        other->granted_.notify_one();
    }
}

/// Nobody who came earlier to the same place is in the way, or this very thread is there already.
bool WriteTurns::mayHave(const Turn& turn) const {
    bool free = true;
    for (const Turn* other = first_; other != &turn; other = other->next_) {
        if (other->place_ != turn.place_) continue;
        if (other->thread_ == turn.thread_ && other->granted_ != 0) return true;
        if (other->kind_ == Kind::Change || turn.kind_ == Kind::Change) free = false;
    }
    return free;
}

int WriteTurns::waiting() const {
    const std::lock_guard lock(mutex_);
    int count = 0;
    for (const Turn* turn = first_; turn != nullptr; turn = turn->next_)
        count += turn->granted_ == 0 ? 1 : 0;
    return count;
}

}  // namespace engine
