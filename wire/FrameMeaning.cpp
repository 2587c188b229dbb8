#include "wire/FrameMeaning.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "wire/Framing.h"
#include "wire/FunctionCodes.h"
#include "wire/Hex.h"

namespace wire {
namespace {

/// More values make no line that anybody reads.
constexpr std::size_t kShownValues = 16;
constexpr const char* kDamaged = "damaged";

struct ExceptionRow {
    std::uint8_t code;
    std::string_view text;
};

/// Source: Modbus Application Protocol V1.1b3, 7.
constexpr std::array kExceptions{
    ExceptionRow{1, "illegal function"},
    ExceptionRow{2, "illegal data address"},
    ExceptionRow{3, "illegal data value"},
    ExceptionRow{4, "server device failure"},
    ExceptionRow{5, "acknowledge"},
    ExceptionRow{6, "server device busy"},
    ExceptionRow{8, "memory parity error"},
    ExceptionRow{10, "gateway path unavailable"},
    ExceptionRow{11, "gateway target device failed to respond"},
};

/// High byte first. REQUIRES: at most four bytes.
std::uint32_t numberOf(ByteView bytes) {
    std::uint32_t number = 0;
    for (const std::uint8_t byte : bytes)
        number = number << 8 | byte;
    return number;
}

std::string whose(std::uint8_t node) {
    return node == 0 ? "all nodes: " : "node " + std::to_string(node) + ": ";
}

std::string some(std::size_t count, std::string_view item) {
    return std::to_string(count) + " " + std::string(item) + (count == 1 ? "" : "s");
}

/// @param value  Gives the value with an index as a number.
template <class ValueAt>
std::string listOf(std::size_t count, ValueAt value) {
    std::string text;
    for (std::size_t i = 0; i < std::min(count, kShownValues); ++i)
        text += (i == 0 ? "" : " ") + std::to_string(value(i));
    return count > kShownValues ? text + " ..." : text;
}

/// The first item is the lowest bit of the first byte.
std::string bitList(ByteView bytes, std::size_t count) {
    return listOf(std::min(count, bytes.size() * 8),
                  [&](std::size_t i) { return bytes[i / 8] >> i % 8 & 1; });
}

std::string wordList(ByteView bytes, std::size_t width) {
    return listOf(bytes.size() / width,
                  [&](std::size_t i) { return numberOf(bytes.subspan(i * width, width)); });
}

std::size_t widthOf(ByteView values, std::size_t count) {
    return count != 0 && values.size() == kLongRegisterBytes * count ? kLongRegisterBytes
                                                                     : kRegisterBytes;
}

std::string_view itemOf(const FunctionRow& row, std::size_t width) {
    return width == kLongRegisterBytes ? "32-bit register" : row.item;
}

std::string bitWord(std::uint32_t value) {
    if (value == 0xFF00) return "on";
    return value == 0 ? "off"
                      : "0x" + hexText(Bytes{static_cast<std::uint8_t>(value >> 8),
                                             static_cast<std::uint8_t>(value & 0xFFU)},
                                       "");
}

std::string placeText(std::size_t address) {
    return " at " + std::to_string(address);
}

std::string unknown(std::uint8_t function, ByteView data) {
    return "function " + std::to_string(function) + ", " + some(data.size(), "byte");
}

/// @param values  Behind the byte count.
std::string writeText(const FunctionRow& row, std::size_t address, std::size_t count,
                      ByteView values) {
    const bool bits = row.form == Form::WriteBits;
    const std::size_t width = bits ? 0 : widthOf(values, count);
    return "write " + some(count, itemOf(row, width)) + placeText(address) + ": " +
           (bits ? bitList(values, count) : wordList(values, width));
}

/// @param data  What stands behind the function.
std::string requestText(std::uint8_t function, ByteView data) {
    constexpr std::size_t kAddressAndCount = 2 + 2;
    const FunctionRow* const row = functionRow(function);
    if (row == nullptr || data.size() < kAddressAndCount) return unknown(function, data);
    const std::uint32_t address = numberOf(data.first(2));
    const ByteView behind = data.subspan(2);
    switch (row->form) {
        case Form::ReadBits:
        case Form::ReadWords:
            return "read " + some(numberOf(behind.first(2)), row->item) + placeText(address);
        case Form::WriteBit:
            return "write " + std::string(row->item) + placeText(address) + ": " +
                   bitWord(numberOf(behind.first(2)));
        case Form::WriteWord:
            return "write " + std::string(itemOf(*row, behind.size())) + placeText(address) + ": " +
                   std::to_string(
                       numberOf(behind.first(std::min(behind.size(), kLongRegisterBytes))));
        case Form::WriteBits:
        case Form::WriteWords:
            break;
    }
    if (data.size() == kAddressAndCount) return unknown(function, data);
    return writeText(*row, address, numberOf(behind.first(2)), data.subspan(kAddressAndCount + 1));
}

std::string exceptionText(ByteView data) {
    if (data.empty()) return "exception without a code";
    for (const auto& [code, text] : kExceptions) {
        if (code == data[0]) return "exception " + std::to_string(code) + ", " + std::string(text);
    }
    return "exception " + std::to_string(data[0]);
}

/// @param count  Items that were asked for; 0 when that is not known.
std::string replyText(std::uint8_t function, ByteView data, std::size_t count) {
    if ((function & kExceptionFlag) != 0) return exceptionText(data);
    const FunctionRow* const row = functionRow(function);
    if (row == nullptr || data.empty()) return unknown(function, data);
    const ByteView values = data.subspan(1);
    if (row->form == Form::ReadBits) return bitList(values, count != 0 ? count : ~std::size_t{0});
    if (row->form == Form::ReadWords) return wordList(values, widthOf(values, count));
    return "written";
}

}  // namespace

std::string FrameMeaning::ofRequest(ByteView frame) {
    last_.reset();
    const auto [raw, message] = decodeFrame(mode_, frame);
    if (message.empty()) return kDamaged;
    const ByteView data = ByteView(message).subspan(2);
    const FunctionRow* const row = functionRow(message[1]);
    const bool reads = row != nullptr && data.size() == 4 && isRead(row->form);
    last_ = Request{message[0], message[1], reads ? numberOf(data.subspan(2)) : 0};
    return whose(message[0]) + requestText(message[1], data);
}

std::string FrameMeaning::ofReply(ByteView frame) const {
    const auto [raw, message] = decodeFrame(mode_, frame);
    if (message.empty()) return kDamaged;
    const auto function = static_cast<std::uint8_t>(message[1] & ~kExceptionFlag);
    const bool answers = last_ && last_->node == message[0] && last_->function == function;
    return whose(message[0]) +
           replyText(message[1], ByteView(message).subspan(2), answers ? last_->count : 0) +
           (answers ? "" : " (not what was asked for)");
}

}  // namespace wire
