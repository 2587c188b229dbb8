// A writer's turn at the place that a tag lies in.
#pragma once

#include "engine/Footprint.h"
#include "engine/WriteTurns.h"

namespace engine {

/// Areas of the driver itself never wait. REQUIRES: the tag has a memory type.
class WriteTurn : public WriteTurns::Turn {
  public:
    using enum WriteTurns::Kind;

    WriteTurn(WriteTurns& turns, const ProtgenTag& tag, WriteTurns::Kind kind)
        : Turn(turns, {tag.nodeId(), tag.memoryType()->nameRef()},
               declaredBlock(tag, true) == 0 ? Free : kind) {}
};

}  // namespace engine
