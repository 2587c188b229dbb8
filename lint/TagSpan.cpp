#include "lint/TagSpan.h"

#include <algorithm>

#include "values/ValueTypes.h"

namespace lint {
namespace {

using settings::AreaInfo;

using values::ValueType;

}  // namespace

bool isBitArea(const AreaInfo& area) {
    const ValueType* natural = values::typeNamed(area.naturalType);
    return natural != nullptr && natural->type == ICU_Type::boolean;
}

TagSpan tagSpan(const TagFacts& facts, const AreaInfo& area) {
    const ICU_Type item = facts.itemType == ICU_Type::none ? facts.type : facts.itemType;
    const ValueType* natural = values::typeNamed(area.naturalType);
    const bool bitArea = isBitArea(area);
    const long long itemBits = bitArea || natural == nullptr ? 1 : natural->bytes * 8LL;
    const bool bits = item == ICU_Type::boolean;
    // In a bit area the driver counts in bytes and the bits within; in registers, in registers.
    const long long unit = bitArea ? 8 : itemBits;
    const long long shift = bitArea || bits ? facts.bitIndex : 0;
    const long long begin = facts.byteOffset * unit + shift;
    const long long length = bits ? facts.length : facts.length * 8LL;
    return {item, begin, begin + std::max(length, 0LL), itemBits};
}

}  // namespace lint
