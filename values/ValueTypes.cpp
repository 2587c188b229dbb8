#include "values/ValueTypes.h"

#include <algorithm>

namespace values {

ValueShape shapeOf(const ITag& tag) {
    return {tag.GetVarType(), static_cast<std::size_t>(std::max(0, tag.GetVarLength()))};
}

const ValueType& rowOf(ICU_Type type) {
    return kValueTypes.at(static_cast<std::size_t>(type) - 1);
}

std::string typeName(ValueShape shape) {
    const ValueType& row = rowOf(shape.type);
    std::string name(row.name);
    if (name.ends_with('-')) name += std::to_string(shape.bytes / row.bytes);
    return name;
}

std::size_t itemCount(ValueShape shape) {
    const ValueType& row = rowOf(shape.type);
    return row.name.ends_with('-') ? shape.bytes / row.bytes : 1;
}

}  // namespace values
