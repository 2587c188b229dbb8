// The Modbus memory map: twelve memory types in four models.
#pragma once

#include <cstdint>
#include <span>
#include <string_view>

#include "framework/MemoryManager.h"

namespace _MRTU {

/// The areas that the driver itself serves; they never reach the line.
enum class DriverArea : std::uint8_t {
    None,
    NodeOverride,  // "NO"
    ModiconMode,   // "NP_Mode"
    Baud,          // "SP_Baud"
    Parity,        // "SP_Par"
    StopBits,      // "SP_Stop"
    LineMode,      // "SP_Mode"
    Apply,         // "SP_Done"
};

/// How an area's write function code is chosen.
enum class WriteChoice : std::uint8_t {
    Keep,       ///< The tag keeps what it has.
    Never,      ///< 0: the area cannot be written.
    Coils,      ///< 15, or 5 after the node's forceFunction.
    Registers,  ///< 16, or 6 after the node's presetFunction.
    Single,     ///< 6, whatever the node says.
};

/// One memory type.
struct MemoryRow {
    struct Range {
        std::int32_t min;
        std::int32_t max;
    };
    std::string_view name;
    ICU_Type naturalType = ICU_Type::none;
    std::uint32_t icomTypes = 0;
    Range range{};          ///< Of indices, in a model that numbers from 1.
    bool numbered = false;  ///< A model that numbers from 0 has both bounds one lower.
    std::int32_t blockReadCount = 0;
    std::int32_t blockWriteCount = 0;
    bool bitRead = false;
    bool bitWrite = false;
    bool bitArrayWrite = false;
    bool readOnly = false;
    bool longRegisters = false;     ///< Offered by the models that have them.
    std::uint8_t readFunction = 0;  ///< Modbus function code; 0: the tag keeps what it has.
    WriteChoice write = WriteChoice::Keep;
    DriverArea area = DriverArea::None;
};

/// One row of the reference address table: the classic five-digit form and the six-digit form of an
/// area's addresses, bounds included.
struct AddressRange {
    std::string_view name;
    std::int32_t shortMin;
    std::int32_t shortMax;
    std::int32_t longMin;
    std::int32_t longMax;
};

extern const std::span<const AddressRange> table;

/// @return the row of the memory type called `name`, or null.
const MemoryRow* memoryRow(std::string_view name);
const AddressRange* addressRange(std::string_view name);

/// Registers the four models.
void registerModels(MemoryManager& manager);

}  // namespace _MRTU
