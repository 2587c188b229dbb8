#include "values/TypeMask.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <bit>

#include "values/ValueTypes.h"

namespace values {
namespace {

constexpr std::uint32_t kAllTypes = (std::uint32_t{1} << kValueTypes.size()) - 1;

constexpr std::uint32_t bitOf(const ValueType& type) {
    return std::uint32_t{1} << (static_cast<unsigned>(type.type) - 1);
}

std::string listOf(std::uint32_t mask) {
    return fmt::format("{}", fmt::join(typeNames(mask), ", "));
}

}  // namespace

std::uint32_t typeMask(std::string_view name) {
    const ValueType* const type = typeNamed(name);
    return type != nullptr ? bitOf(*type) : 0;
}

std::vector<std::string_view> typeNames(std::uint32_t mask) {
    std::vector<std::string_view> names;
    for (const ValueType& type : kValueTypes) {
        if ((mask & bitOf(type)) != 0) names.push_back(type.name);
    }
    return names;
}

std::string typesText(std::uint32_t mask) {
    const std::uint32_t missing = kAllTypes & ~mask;
    if (missing == 0) return "all";
    if (std::popcount(missing) < std::popcount(mask)) return "all but " + listOf(missing);
    return listOf(mask);
}

}  // namespace values
