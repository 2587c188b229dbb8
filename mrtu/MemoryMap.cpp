#include "mrtu/MemoryMap.h"

#include <algorithm>
#include <string>

#include "mrtu/ModbusNumbers.h"

namespace _MRTU {

namespace {

using Ranges = std::array<MemoryRow::Range, 4>;

constexpr std::array<std::string_view, 4> modelNames{"1", "2", "3", "4"};

// The models "1" and "3" number an area from 1 within its decade, "2" and "4" from 0.
constexpr Ranges decade(std::int32_t base) {
    const MemoryRow::Range oneBased{base + 1, base + 65536};
    const MemoryRow::Range zeroBased{base, base + 65535};
    return {oneBased, zeroBased, oneBased, zeroBased};
}

constexpr Ranges everywhere(std::int32_t min, std::int32_t max) {
    const MemoryRow::Range range{min, max};
    return {range, range, range, range};
}

constexpr std::uint32_t kUnsignedByte = 0x10;
constexpr std::uint32_t kBoolean = 0x1;
constexpr std::uint32_t kBits = 0x1001;
constexpr std::uint32_t kUnsignedInt = 0x40;
constexpr std::uint32_t kDoubleWords = 0xc80c8;
constexpr std::uint32_t kAnyButTimeAndObject = 0x3dff7ff;

constexpr MemoryRow own(std::string_view name, ICU_Type natural, std::uint32_t icomTypes,
                        std::int32_t blockCount, std::int32_t maxIndex, DriverArea area) {
    return {.name = name,
            .naturalType = natural,
            .icomTypes = icomTypes,
            .ranges = everywhere(0, maxIndex),
            .blockReadCount = blockCount,
            .blockWriteCount = blockCount,
            .area = area};
}

}  // namespace

// Limits a request: 2000 bits read, 1968 bits written, 125 registers read, 123 registers written;
// half of that for 32-bit registers. Source: Modbus Application Protocol V1.1b3, 6.1 to 6.12.
constexpr std::array<MemoryRow, 12> memoryRows{
    MemoryRow{.name = "INP",
              .naturalType = ICU_Type::boolean,
              .icomTypes = kBits,
              .ranges = decade(100000),
              .blockReadCount = 2000,
              .bitRead = true,
              .readOnly = true,
              .readFunction = kReadInputs,
              .write = WriteChoice::never},
    MemoryRow{.name = "OUTP",
              .naturalType = ICU_Type::boolean,
              .icomTypes = kBits,
              .ranges = decade(0),
              .blockReadCount = 2000,
              .blockWriteCount = 1968,
              .bitRead = true,
              .bitWrite = true,
              .bitArrayWrite = true,
              .readFunction = kReadCoils,
              .write = WriteChoice::coils},
    MemoryRow{.name = "HREG",
              .naturalType = ICU_Type::unsignedShort,
              .icomTypes = kAnyButTimeAndObject,
              .ranges = decade(400000),
              .blockReadCount = 125,
              .blockWriteCount = 123,
              .readFunction = kReadRegisters,
              .write = WriteChoice::registers},
    MemoryRow{.name = "IREG",
              .naturalType = ICU_Type::unsignedShort,
              .icomTypes = kAnyButTimeAndObject,
              .ranges = decade(300000),
              .blockReadCount = 125,
              .readOnly = true,
              .readFunction = kReadInputRegisters,
              .write = WriteChoice::never},
    MemoryRow{.name = "LONG",
              .naturalType = ICU_Type::unsignedInt,
              .icomTypes = kDoubleWords,
              .ranges = everywhere(0, 65535),
              .blockReadCount = 62,
              .blockWriteCount = 61,
              .enronOnly = true,
              .readFunction = kReadRegisters,
              .write = WriteChoice::single},
    own("NO", ICU_Type::unsignedByte, kUnsignedByte, 1, 1, DriverArea::nodeOverride),
    own("NP_Mode", ICU_Type::boolean, kBoolean, 1, 0, DriverArea::modiconMode),
    own("SP_Baud", ICU_Type::unsignedInt, kUnsignedInt, 0, 0, DriverArea::baud),
    own("SP_Par", ICU_Type::unsignedByte, kUnsignedByte, 0, 0, DriverArea::parity),
    own("SP_Stop", ICU_Type::unsignedByte, kUnsignedByte, 0, 0, DriverArea::stopBits),
    // Natural type and mask disagree here, and tools and projects count on both.
    own("SP_Mode", ICU_Type::boolean, kUnsignedByte, 0, 0, DriverArea::lineMode),
    own("SP_Done", ICU_Type::boolean, kBoolean, 0, 0, DriverArea::apply),
};

constexpr std::array<AddressRange, 5> table{
    AddressRange{"INP", 10001, 19999, 100001, 165536},
    AddressRange{"OUTP", 1, 9999, 1, 65536},
    AddressRange{"HREG", 40001, 49999, 400001, 465536},
    AddressRange{"IREG", 30001, 39999, 300001, 365536},
    AddressRange{"LONG", 0, 65535, 0, 65535},
};

namespace {

constexpr bool rowsAreComplete() {
    return std::all_of(memoryRows.begin(), memoryRows.end(), [](const MemoryRow& row) {
        const bool onTheLine = row.area == DriverArea::none;
        return !row.name.empty() && row.icomTypes != 0 && onTheLine == (row.readFunction != 0) &&
               row.readOnly == (row.write == WriteChoice::never);
    });
}
static_assert(rowsAreComplete());

constexpr bool rangesHaveRows() {
    return std::all_of(table.begin(), table.end(), [](const AddressRange& range) {
        return std::any_of(memoryRows.begin(), memoryRows.end(),
                           [&](const MemoryRow& row) { return row.name == range.name; });
    });
}
static_assert(rangesHaveRows());

template <class Rows>
auto findRow(const Rows& rows, std::string_view name) {
    const auto row = std::find_if(rows.begin(), rows.end(),
                                  [name](const auto& each) { return each.name == name; });
    return row != rows.end() ? &*row : nullptr;
}

MemoryType memoryTypeFor(const MemoryRow& row, const MemoryRow::Range& range) {
    MemoryType type;
    type.setName(std::string(row.name));
    type.setNaturalType(row.naturalType);
    type.setIcomTypes(static_cast<int>(row.icomTypes));
    type.setBitRead(row.bitRead);
    type.setBitWrite(row.bitWrite);
    type.setBitArrayWrite(row.bitArrayWrite);
    type.setReadOnly(row.readOnly);
    type.setBlockReadCount(row.blockReadCount);
    type.setBlockWriteCount(row.blockWriteCount);
    type.setMinIndex(range.min);
    type.setMaxIndex(range.max);
    return type;
}

bool isEnron(std::string_view model) {
    return model == "3" || model == "4";
}

}  // namespace

const MemoryRow* memoryRow(std::string_view name) {
    return findRow(memoryRows, name);
}

const AddressRange* addressRange(std::string_view name) {
    return findRow(table, name);
}

void registerModels(MemoryManager& manager) {
    for (std::size_t index = 0; index < modelNames.size(); ++index) {
        Model model{std::string(modelNames[index])};
        model.setMaxDatagramItems(0);
        model.setMaxDatagramLength(0);
        for (const MemoryRow& row : memoryRows)
            if (!row.enronOnly || isEnron(modelNames[index]))
                model.addMemoryType(memoryTypeFor(row, row.ranges[index]));
        manager.addModel(model);
    }
}

}  // namespace _MRTU
