// Which items of its area a tag stands for. Pure.
#pragma once

#include "lint/TagLines.h"
#include "settings/DriverDescription.h"

namespace lint {

/// The bits of an area that a tag stands for, `end` excluded, counted from the area's first item.
struct TagSpan {
    ICU_Type item;  ///< Type of one value.
    long long begin;
    long long end;
    long long itemBits;  ///< Of the area.

    [[nodiscard]] bool isBits() const { return item == ICU_Type::boolean; }
    [[nodiscard]] long long firstItem() const { return begin / itemBits; }
    [[nodiscard]] long long endItem() const { return (end + itemBits - 1) / itemBits; }
};

/// REQUIRES: the driver has accepted the tag.
TagSpan tagSpan(const TagFacts& facts, const settings::AreaInfo& area);

/// @return true when an item of the area is a bit.
bool isBitArea(const settings::AreaInfo& area);

}  // namespace lint
