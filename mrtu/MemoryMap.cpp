#include "mrtu/MemoryMap.h"

#include <algorithm>
#include <array>
#include <string>

#include "mrtu/ModbusNumbers.h"
#include "mrtu/Models.h"

namespace _MRTU {

namespace {

// 65536 items, the first of them number 1 of its decade.
constexpr MemoryRow::Range decade(std::int32_t base) {
    return {base + 1, base + 65536};
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
            .range = {0, maxIndex},
            .blockReadCount = blockCount,
            .blockWriteCount = blockCount,
            .area = area};
}

// Limits a request: 2000 bits read, 1968 bits written, 125 registers read, 123 registers written;
// half of that for 32-bit registers. Source: Modbus Application Protocol V1.1b3, 6.1 to 6.12.
constexpr std::array kMemoryRows{
    MemoryRow{.name = "INP",
              .naturalType = ICU_Type::boolean,
              .icomTypes = kBits,
              .range = decade(100000),
              .numbered = true,
              .blockReadCount = 2000,
              .bitRead = true,
              .readOnly = true,
              .readFunction = kReadInputs,
              .write = WriteChoice::Never},
    MemoryRow{.name = "OUTP",
              .naturalType = ICU_Type::boolean,
              .icomTypes = kBits,
              .range = decade(0),
              .numbered = true,
              .blockReadCount = 2000,
              .blockWriteCount = 1968,
              .bitRead = true,
              .bitWrite = true,
              .bitArrayWrite = true,
              .readFunction = kReadCoils,
              .write = WriteChoice::Coils},
    MemoryRow{.name = "HREG",
              .naturalType = ICU_Type::unsignedShort,
              .icomTypes = kAnyButTimeAndObject,
              .range = decade(400000),
              .numbered = true,
              .blockReadCount = 125,
              .blockWriteCount = 123,
              .readFunction = kReadRegisters,
              .write = WriteChoice::Registers},
    MemoryRow{.name = "IREG",
              .naturalType = ICU_Type::unsignedShort,
              .icomTypes = kAnyButTimeAndObject,
              .range = decade(300000),
              .numbered = true,
              .blockReadCount = 125,
              .readOnly = true,
              .readFunction = kReadInputRegisters,
              .write = WriteChoice::Never},
    MemoryRow{.name = "LONG",
              .naturalType = ICU_Type::unsignedInt,
              .icomTypes = kDoubleWords,
              .range = {0, 65535},
              .blockReadCount = 62,
              .blockWriteCount = 61,
              .longRegisters = true,
              .readFunction = kReadRegisters,
              .write = WriteChoice::Single},
    own("NO", ICU_Type::unsignedByte, kUnsignedByte, 1, 1, DriverArea::NodeOverride),
    own("NP_Mode", ICU_Type::boolean, kBoolean, 1, 0, DriverArea::ModiconMode),
    own("SP_Baud", ICU_Type::unsignedInt, kUnsignedInt, 0, 0, DriverArea::Baud),
    own("SP_Par", ICU_Type::unsignedByte, kUnsignedByte, 0, 0, DriverArea::Parity),
    own("SP_Stop", ICU_Type::unsignedByte, kUnsignedByte, 0, 0, DriverArea::StopBits),
    // Natural type and mask disagree here, and tools and projects count on both.
    own("SP_Mode", ICU_Type::boolean, kUnsignedByte, 0, 0, DriverArea::LineMode),
    own("SP_Done", ICU_Type::boolean, kBoolean, 0, 0, DriverArea::Apply),
};

constexpr std::array kAddressRanges{
    AddressRange{"INP", 10001, 19999, 100001, 165536},
    AddressRange{"OUTP", 1, 9999, 1, 65536},
    AddressRange{"HREG", 40001, 49999, 400001, 465536},
    AddressRange{"IREG", 30001, 39999, 300001, 365536},
    AddressRange{"LONG", 0, 65535, 0, 65535},
};

constexpr bool rowsAreComplete() {
    return std::all_of(kMemoryRows.begin(), kMemoryRows.end(), [](const MemoryRow& row) {
        const bool onTheLine = row.area == DriverArea::None;
        return !row.name.empty() && row.icomTypes != 0 && onTheLine == (row.readFunction != 0) &&
               row.readOnly == (row.write == WriteChoice::Never);
    });
}
static_assert(rowsAreComplete());

template <class Rows>
constexpr auto findRow(const Rows& rows, std::string_view name) {
    const auto row = std::find_if(rows.begin(), rows.end(),
                                  [name](const auto& each) { return each.name == name; });
    return row != rows.end() ? &*row : nullptr;
}

// Without an address range every tag of the area would be refused; a range without its area is
// dead.
constexpr bool areasOnTheLineHaveRanges() {
    return std::all_of(kMemoryRows.begin(), kMemoryRows.end(), [](const MemoryRow& row) {
        const AddressRange* range = findRow(kAddressRanges, row.name);
        if (row.area != DriverArea::None) return range == nullptr;
        return range != nullptr && range->longMin == row.range.min &&
               range->longMax == row.range.max;
    });
}
static_assert(areasOnTheLineHaveRanges());

constexpr bool rangesHaveAreas() {
    return std::all_of(kAddressRanges.begin(), kAddressRanges.end(), [](const AddressRange& range) {
        return findRow(kMemoryRows, range.name) != nullptr;
    });
}
static_assert(rangesHaveAreas());

template <class Rows>
constexpr bool namesDiffer(const Rows& rows) {
    return std::all_of(rows.begin(), rows.end(),
                       [&](const auto& row) { return findRow(rows, row.name) == &row; });
}
static_assert(namesDiffer(kMemoryRows) && namesDiffer(kAddressRanges) && namesDiffer(kModels));

MemoryType memoryTypeFor(const MemoryRow& row, const ModelRow& model) {
    const int shift = row.numbered && model.zeroBased ? 1 : 0;
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
    type.setMinIndex(row.range.min - shift);
    type.setMaxIndex(row.range.max - shift);
    return type;
}

}  // namespace

constexpr std::span<const AddressRange> table = kAddressRanges;

const MemoryRow* memoryRow(std::string_view name) {
    return findRow(kMemoryRows, name);
}

const AddressRange* addressRange(std::string_view name) {
    return findRow(kAddressRanges, name);
}

void registerModels(MemoryManager& manager) {
    for (const ModelRow& row : kModels) {
        Model model{std::string(row.name)};
        model.setMaxDatagramItems(0);
        model.setMaxDatagramLength(0);
        for (const MemoryRow& memory : kMemoryRows)
            if (row.longRegisters || !memory.longRegisters)
                model.addMemoryType(memoryTypeFor(memory, row));
        manager.addModel(model);
    }
}

}  // namespace _MRTU
