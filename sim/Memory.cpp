#include "sim/Memory.h"

#include <algorithm>
#include <stdexcept>
#include <string>
#include <utility>

namespace sim {
namespace {

constexpr std::uint32_t kAddresses = 65536;

void requireFits(std::uint32_t base, std::uint32_t count, const char* what) {
    if (count > kAddresses || base + count > kAddresses) {
        throw std::invalid_argument(std::string(what) + " reach beyond address 65535");
    }
}

}  // namespace

std::uint32_t initialValue(Area area, std::uint8_t node, std::uint16_t address) {
    const std::uint32_t n = node;
    const std::uint32_t a = address;
    switch (area) {
        case Area::Coil:
            return (a + n) % 3 == 0 ? 1 : 0;
        case Area::DiscreteInput:
            return (a + n) % 5 < 2 ? 1 : 0;
        case Area::HoldingRegister:
            return (1000 * n + a) & 0xFFFFU;
        case Area::InputRegister:
            return (30000 + 1000 * n + a) & 0xFFFFU;
        case Area::LongRegister:
            return 100003U * (1000 * n + a);  // Unsigned: wraps at 2^32.
    }
    return 0;
}

Memory::Memory(std::uint8_t node, const AreaSizes& sizes, std::optional<LongRange> longs,
               std::vector<RefusedRange> refused)
    : longs_(longs), refused_(std::move(refused)) {
    const LongRange range = longs.value_or(LongRange{.base = 0, .count = 0});
    addArea(Area::Coil, node, 0, sizes.coils, 1);
    addArea(Area::DiscreteInput, node, 0, sizes.discreteInputs, 1);
    addArea(Area::HoldingRegister, node, 0, sizes.holdingRegisters, 0xFFFF);
    addArea(Area::InputRegister, node, 0, sizes.inputRegisters, 0xFFFF);
    addArea(Area::LongRegister, node, range.base, range.count, 0xFFFFFFFF);
}

void Memory::addArea(Area area, std::uint8_t node, std::uint32_t base, std::uint32_t count,
                     std::uint32_t mask) {
    requireFits(base, count, "the items of an area");
    Cells cells{.base = base, .mask = mask, .values = {}};
    cells.values.reserve(count);
    for (std::uint32_t i = 0; i < count; ++i) {
        cells.values.push_back(initialValue(area, node, static_cast<std::uint16_t>(base + i)));
    }
    areas_.push_back(std::move(cells));
}

bool Memory::has(Area area, std::uint32_t address, std::uint32_t count) const {
    const Cells& own = cells(area);
    if (address < own.base) return false;
    const std::size_t index = address - own.base;
    return index <= own.values.size() && count <= own.values.size() - index;
}

bool Memory::refuses(Area area, std::uint32_t address, std::uint32_t count) const {
    const Area named = area == Area::LongRegister ? Area::HoldingRegister : area;
    return std::any_of(refused_.begin(), refused_.end(), [&](const RefusedRange& range) {
        return range.area == named && address <= range.last && address + count > range.first;
    });
}

std::uint32_t Memory::get(Area area, std::uint32_t address) const {
    const Cells& own = cells(area);
    return own.values[address - own.base];
}

void Memory::set(Area area, std::uint32_t address, std::uint32_t value) {
    Cells& own = cells(area);
    own.values[address - own.base] = value & own.mask;
}

Memory::Cells& Memory::cells(Area area) {
    return areas_[static_cast<std::size_t>(area)];
}

const Memory::Cells& Memory::cells(Area area) const {
    return areas_[static_cast<std::size_t>(area)];
}

}  // namespace sim
