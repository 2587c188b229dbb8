#include "values/ValueTypes.h"

#include <algorithm>

#include <algorithm>

namespace values {

ValueShape shapeOf(const ITag& tag) {
    return {tag.GetVarType(), static_cast<std::size_t>(std::max(0, tag.GetVarLength()))};
}

const ValueType& rowOf(ICU_Type type) {
    return kValueTypes.at(static_cast<std::size_t>(type) - 1);
}

const ValueType& itemRowOf(ICU_Type type) {
    const ValueType& row = rowOf(type);
    return row.kind == ValueKind::Array ? rowOf(row.item) : row;
}

bool holdsNumbers(ICU_Type type) {
    const ValueKind kind = itemRowOf(type).kind;
    return kind == ValueKind::Signed || kind == ValueKind::Unsigned || kind == ValueKind::Real;
}

const ValueType* typeNamed(std::string_view name) {
    const auto* const row =
        std::find_if(kValueTypes.begin(), kValueTypes.end(),
                     [name](const ValueType& each) { return each.name == name; });
    return row != kValueTypes.end() ? row : nullptr;
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
