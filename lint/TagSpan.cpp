#include "lint/TagSpan.h"

#include "values/ItemSpan.h"

namespace lint {

using settings::AreaInfo;

bool isBitArea(const AreaInfo& area) {
    return values::itemBytesOf(area.naturalType) == 0;
}

TagSpan tagSpan(const TagFacts& facts, const AreaInfo& area) {
    const int itemBytes = values::itemBytesOf(area.naturalType);
    const values::BitSpan span = values::bitSpan(
        {facts.byteOffset, facts.bitIndex, facts.type, facts.itemType, facts.length}, itemBytes);
    const ICU_Type item = facts.itemType == ICU_Type::none ? facts.type : facts.itemType;
    return {item, span.begin, span.end, itemBytes == 0 ? 1 : itemBytes * 8LL};
}

}  // namespace lint
