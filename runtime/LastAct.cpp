// The acts that a signal handler may still do.
#include "runtime/LastAct.h"

#include <array>
#include <atomic>

namespace runtime {
namespace {

enum class Stage : int { Free, Taken, Announced };

struct Place {
    std::atomic<Stage> stage{Stage::Free};
    LastAct::Undo undo = nullptr;
    const void* what = nullptr;
};
static_assert(std::atomic<Stage>::is_always_lock_free, "a signal handler can't wait for a lock");

// No constructor runs at the start of the process and no destructor at its end.
constinit std::array<Place, kLastActs> g_places{};

}  // namespace

LastAct::LastAct(Undo undo, const void* what) {
    for (int number = 0; number < kLastActs; ++number) {
        Place& place = g_places[static_cast<std::size_t>(number)];
        Stage expected = Stage::Free;
        if (!place.stage.compare_exchange_strong(expected, Stage::Taken)) continue;
        place.undo = undo;
        place.what = what;
        place.stage.store(Stage::Announced);
        place_ = number;
        return;
    }
}

LastAct::~LastAct() {
    if (place_ >= 0) g_places[static_cast<std::size_t>(place_)].stage.store(Stage::Free);
}

void runLastActs() noexcept {
    for (const Place& place : g_places) {
        if (place.stage.load() == Stage::Announced) place.undo(place.what);
    }
}

}  // namespace runtime
