#include "sim/Functions.h"

#include <algorithm>
#include <array>

#include "wire/FunctionCodes.h"

namespace sim {
namespace {

using wire::Bytes;
using wire::ByteView;
using wire::Form;
using wire::FunctionRow;

struct AreaRow {
    std::uint8_t code;
    Area area;
};

/// The memory that each function works on, row by row as the functions.
constexpr std::array kAreas{
    AreaRow{1, Area::Coil},
    AreaRow{2, Area::DiscreteInput},
    AreaRow{3, Area::HoldingRegister},
    AreaRow{4, Area::InputRegister},
    AreaRow{5, Area::Coil},
    AreaRow{6, Area::HoldingRegister},
    AreaRow{15, Area::Coil},
    AreaRow{16, Area::HoldingRegister},
};
static_assert(std::equal(kAreas.begin(), kAreas.end(), wire::kFunctions.begin(),
                         wire::kFunctions.end(),
                         [](const AreaRow& a, const FunctionRow& b) { return a.code == b.code; }));

Area areaOf(const FunctionRow& row) {
    return kAreas[static_cast<std::size_t>(&row - wire::kFunctions.data())].area;
}

/// The 250 data bytes of 125 registers, 4 for each.
constexpr std::uint32_t kMaxReadLongs = 125 * 2 / 4;

constexpr std::size_t kHeader = 1 + 2 + 2;  // Function, address, count or value.

std::uint16_t wordAt(ByteView bytes, std::size_t index) {
    return static_cast<std::uint16_t>(bytes[index] << 8U | bytes[index + 1]);
}

/// Most significant byte first.
void put(Bytes& out, std::uint32_t value, std::size_t width) {
    for (std::size_t i = width; i > 0; --i) {
        out.push_back(static_cast<std::uint8_t>(value >> (8 * (i - 1)) & 0xFFU));
    }
}

std::uint32_t take(ByteView bytes) {
    std::uint32_t value = 0;
    for (const std::uint8_t byte : bytes)
        value = value << 8U | byte;
    return value;
}

bool isBit(Area area) {
    return area == Area::Coil || area == Area::DiscreteInput;
}

/// Bytes of one register on the line.
std::size_t widthOf(Area area) {
    return area == Area::LongRegister ? 4 : 2;
}

std::size_t dataBytes(Area area, std::uint32_t count) {
    return isBit(area) ? (count + 7) / 8 : count * widthOf(area);
}

/// The area that the request means: Enron registers hide behind functions 3 and 6.
Area areaAt(const FunctionRow& row, const Memory& memory, std::uint16_t address) {
    const Area area = areaOf(row);
    const bool mayBeLong = area == Area::HoldingRegister && row.form != Form::WriteWords;
    const bool isLong = mayBeLong && memory.longs() && memory.longs()->contains(address);
    return isLong ? Area::LongRegister : area;
}

bool inReach(const Memory& memory, Area area, std::uint32_t address, std::uint32_t count) {
    if (!memory.has(area, address, count) || memory.refuses(area, address, count)) return false;
    if (area != Area::HoldingRegister || !memory.longs()) return true;
    const LongRange& longs = *memory.longs();
    return address + count <= longs.base || address >= longs.base + longs.count;
}

Bytes refuse(ByteView request, Exception code) {
    return exceptionReply(request[0], static_cast<std::uint8_t>(code));
}

Bytes packBits(const Memory& memory, Area area, std::uint32_t address, std::uint32_t count) {
    Bytes bits(dataBytes(area, count), 0);
    for (std::uint32_t i = 0; i < count; ++i) {
        const std::uint32_t bit = memory.get(area, address + i) << (i % 8);
        bits[i / 8] = static_cast<std::uint8_t>(bits[i / 8] | bit);
    }
    return bits;
}

Bytes packRegisters(const Memory& memory, Area area, std::uint32_t address, std::uint32_t count) {
    Bytes data;
    for (std::uint32_t i = 0; i < count; ++i) {
        put(data, memory.get(area, address + i), widthOf(area));
    }
    return data;
}

Bytes read(const FunctionRow& row, const Memory& memory, ByteView request) {
    if (request.size() != kHeader) return refuse(request, Exception::IllegalDataValue);
    const std::uint16_t address = wordAt(request, 1);
    const std::uint16_t count = wordAt(request, 3);
    const Area area = areaAt(row, memory, address);
    const std::uint32_t limit = area == Area::LongRegister ? kMaxReadLongs : row.maxCount;
    if (count < 1 || count > limit) return refuse(request, Exception::IllegalDataValue);
    if (!inReach(memory, area, address, count)) {
        return refuse(request, Exception::IllegalDataAddress);
    }
    const Bytes data = isBit(area) ? packBits(memory, area, address, count)
                                   : packRegisters(memory, area, address, count);
    Bytes reply{row.code, static_cast<std::uint8_t>(data.size())};
    reply.insert(reply.end(), data.begin(), data.end());
    return reply;
}

Bytes writeOne(const FunctionRow& row, Memory& memory, ByteView request) {
    if (request.size() < kHeader) return refuse(request, Exception::IllegalDataValue);
    const std::uint16_t address = wordAt(request, 1);
    const Area area = areaAt(row, memory, address);
    if (request.size() != 1 + 2 + widthOf(area)) {
        return refuse(request, Exception::IllegalDataValue);
    }
    const std::uint32_t value = take(request.subspan(3));
    const bool legal = area != Area::Coil || value == 0x0000 || value == 0xFF00;
    if (!legal) return refuse(request, Exception::IllegalDataValue);
    if (!inReach(memory, area, address, 1)) return refuse(request, Exception::IllegalDataAddress);
    memory.set(area, address, area == Area::Coil ? value >> 15U : value);
    return {request.begin(), request.end()};
}

std::uint32_t itemAt(Area area, ByteView data, std::uint32_t index) {
    if (isBit(area)) return static_cast<std::uint32_t>(data[index / 8]) >> (index % 8);
    return wordAt(data, 2 * static_cast<std::size_t>(index));
}

Bytes writeMany(const FunctionRow& row, Memory& memory, ByteView request) {
    if (request.size() < kHeader + 1) return refuse(request, Exception::IllegalDataValue);
    const std::uint16_t address = wordAt(request, 1);
    const std::uint16_t count = wordAt(request, 3);
    const ByteView data = request.subspan(kHeader + 1);
    const Area area = areaOf(row);
    const bool legal = count >= 1 && count <= row.maxCount &&
                       request[kHeader] == dataBytes(area, count) &&
                       data.size() == request[kHeader];
    if (!legal) return refuse(request, Exception::IllegalDataValue);
    if (!inReach(memory, area, address, count)) {
        return refuse(request, Exception::IllegalDataAddress);
    }
    for (std::uint32_t i = 0; i < count; ++i) {
        memory.set(area, address + i, itemAt(area, data, i));
    }
    return {request.begin(), request.begin() + kHeader};
}

}  // namespace

Bytes exceptionReply(std::uint8_t function, std::uint8_t code) {
    return {static_cast<std::uint8_t>(function | 0x80U), code};
}

bool isWrite(std::uint8_t function) {
    const FunctionRow* const row = wire::functionRow(function);
    return row != nullptr && !wire::isRead(row->form);
}

Bytes execute(Memory& memory, ByteView request) {
    const FunctionRow* const row = wire::functionRow(request[0]);
    if (row == nullptr) return refuse(request, Exception::IllegalFunction);
    if (wire::isRead(row->form)) return read(*row, memory, request);
    if (wire::isSingleWrite(row->form)) return writeOne(*row, memory, request);
    return writeMany(*row, memory, request);
}

}  // namespace sim
