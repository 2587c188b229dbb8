// Places of tags without a description of the driver.
#pragma once

#include <string>

#include "platform/IProtocol.h"
#include "poll/Plan.h"

namespace poll_test {

/// A tag's place, by the driver's answers and the widths that the areas are known to have.
inline poll::TagPlace placeOf(IProtocol4& engine, const ITag& tag) {
    const std::string uri = tag.GetVarName();
    const std::size_t begin = uri.find('?') + 1;
    poll::TagPlace place;
    place.node = engine.GetNodeID(&tag);
    place.area = uri.substr(begin, uri.find('?', begin) - begin);
    place.bits = engine.CanReadBitBlock(&tag);
    place.itemBytes = place.bits ? 0 : place.area == "LONG" ? 4 : 2;
    place.first = static_cast<int>(tag.GetByteOffset());
    if (place.bits) place.first = place.first * 8 + tag.GetBitIndex();
    place.items =
        place.bits ? tag.GetVarLength() : (tag.PackedLen() + place.itemBytes - 1) / place.itemBytes;
    return place;
}

}  // namespace poll_test
