#include "sim/Presence.h"

namespace sim {

bool Presence::at(Nanos sinceStart) const {
    return away == Nanos(0) || sinceStart % (there + away) < there;
}

}  // namespace sim
