// The memory of one simulated node.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

namespace sim {

/// Addresses count from 0, as they do on the line.
enum class Area : std::uint8_t {
    Coil,             ///< 1 bit, functions 1, 5, 15.
    DiscreteInput,    ///< 1 bit, function 2.
    HoldingRegister,  ///< 16 bits, functions 3, 6, 16.
    InputRegister,    ///< 16 bits, function 4.
    LongRegister,     ///< 32 bits (Enron), functions 3 and 6.
};

/// Items of each area, 0..65536.
struct AreaSizes {
    std::uint32_t coils = 10000;
    std::uint32_t discreteInputs = 10000;
    std::uint32_t holdingRegisters = 10000;
    std::uint32_t inputRegisters = 10000;
};

/// The addresses base .. base + count - 1 that functions 3 and 6 take for 32-bit registers; the
/// holding registers of the same addresses are out of the line's reach. base + count <= 65536.
struct LongRange {
    std::uint16_t base = 5000;
    std::uint32_t count = 1000;

    bool contains(std::uint32_t address) const { return address >= base && address - base < count; }
};

/// Addresses that a node has and yet refuses. A range of holding registers holds for the 32-bit
/// registers of the same addresses, too.
struct RefusedRange {
    Area area = Area::HoldingRegister;
    std::uint32_t first = 0;
    std::uint32_t last = 0;  ///< Refused as well.

    bool operator==(const RefusedRange&) const = default;
};

/// What an item holds at first; every area is a formula of node n and address a:
///   coil             1 when (a + n) mod 3 is 0
///   discrete input   1 when (a + n) mod 5 is 0 or 1
///   holding register (1000 n + a) mod 65536
///   input register   (30000 + 1000 n + a) mod 65536
///   long register    (100003 (1000 n + a)) mod 2^32
std::uint32_t initialValue(Area area, std::uint8_t node, std::uint16_t address);

/// Threads: one at a time.
class Memory {
  public:
    /// Errors: std::invalid_argument when a size or the range exceeds 65536.
    Memory(std::uint8_t node, const AreaSizes& sizes, std::optional<LongRange> longs,
           std::vector<RefusedRange> refused = {});

    /// Whether `count` items from `address` on exist.
    bool has(Area area, std::uint32_t address, std::uint32_t count) const;

    /// Whether a request for these items is refused although they exist.
    bool refuses(Area area, std::uint32_t address, std::uint32_t count) const;

    /// REQUIRES: has(area, address, 1).
    std::uint32_t get(Area area, std::uint32_t address) const;

    /// Stores the low 1, 16 or 32 bits. REQUIRES: has(area, address, 1).
    void set(Area area, std::uint32_t address, std::uint32_t value);

    /// The range of the 32-bit registers; nothing on a plain node.
    const std::optional<LongRange>& longs() const { return longs_; }

  private:
    struct Cells {
        std::uint32_t base = 0;
        std::uint32_t mask = 0;
        std::vector<std::uint32_t> values;
    };

    void addArea(Area area, std::uint8_t node, std::uint32_t base, std::uint32_t count,
                 std::uint32_t mask);
    Cells& cells(Area area);
    const Cells& cells(Area area) const;

    std::optional<LongRange> longs_;
    std::vector<RefusedRange> refused_;
    std::vector<Cells> areas_;  // One for each Area, in its order.
};

}  // namespace sim
