// The function codes of Modbus as they look on the line. Pure.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace wire {

/// In the function of a reply: the request was refused. Source: Modbus Application Protocol V1.1b3,
/// 7.
inline constexpr std::uint8_t kExceptionFlag = 0x80;

/// How a function's request and reply are laid out behind the function.
enum class Form : std::uint8_t {
    ReadBits,    ///< Address, count; reply: byte count, bits.
    ReadWords,   ///< Address, count; reply: byte count, registers.
    WriteBit,    ///< Address, FF00 or 0000; reply: the same.
    WriteWord,   ///< Address, value; reply: the same.
    WriteBits,   ///< Address, count, byte count, bits; reply: address, count.
    WriteWords,  ///< Address, count, byte count, registers; reply: address, count.
};

/// Bytes of a register, and of a register of 32 bits (Enron). The latter share the functions of the
/// holding registers; only the number of bytes tells them apart.
inline constexpr std::size_t kRegisterBytes = 2;
inline constexpr std::size_t kLongRegisterBytes = 4;

/// Source: Modbus Application Protocol V1.1b3, 6.1 to 6.6, 6.11, 6.12.
struct FunctionRow {
    std::uint8_t code;
    Form form;
    std::string_view item;   ///< What is read or written.
    std::uint16_t maxCount;  ///< Items of one request, registers of 16 bits.
};

inline constexpr std::array kFunctions{
    FunctionRow{1, Form::ReadBits, "coil", 2000},
    FunctionRow{2, Form::ReadBits, "discrete input", 2000},
    FunctionRow{3, Form::ReadWords, "holding register", 125},
    FunctionRow{4, Form::ReadWords, "input register", 125},
    FunctionRow{5, Form::WriteBit, "coil", 1},
    FunctionRow{6, Form::WriteWord, "holding register", 1},
    FunctionRow{15, Form::WriteBits, "coil", 1968},
    FunctionRow{16, Form::WriteWords, "holding register", 123},
};

/// @return the row of a function code, null for one that is not among them.
constexpr const FunctionRow* functionRow(std::uint8_t code) {
    const auto* const row =
        std::find_if(kFunctions.begin(), kFunctions.end(),
                     [code](const FunctionRow& each) { return each.code == code; });
    return row == kFunctions.end() ? nullptr : row;
}

constexpr bool isRead(Form form) {
    return form == Form::ReadBits || form == Form::ReadWords;
}

/// Whether the request carries one value and no count.
constexpr bool isSingleWrite(Form form) {
    return form == Form::WriteBit || form == Form::WriteWord;
}

}  // namespace wire
