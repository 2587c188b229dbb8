// Byte orders by name in tag URIs, turned into the conversions that make them. Pure.
//
// Devices send the two registers of a 32-bit number in one of four orders, and the four of a
// 64-bit number in one of eight. An order is written as the bytes travel: A is the number's most
// significant byte, so ABCD is the usual order, CDAB the one with the low register first. In texts
// and other strings of bytes A is the first byte.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>

namespace values {

/// One order of a number of 2, 4 or 8 bytes in 16-bit registers.
struct ByteOrder {
    std::string_view name;         ///< A letter for each byte.
    std::string_view conversions;  ///< As a tag URI lists them; empty where none are needed.
};

/// @return all orders, short ones first, the usual one of each length in front.
std::span<const ByteOrder> byteOrders();

/// Turns "1?HREG?400010?float@ABCD" into "1?HREG?400010?float(swap2,swap4)". Upper and lower case
/// count as equal; other conversions may stand in front of the order or behind it and keep their
/// places: "int(neg)@ABCD". In the areas of 32-bit registers (LONG) the conversions are others.
/// @return the URI that a driver takes; a URI without an order as it is.
/// Errors: ValueError when the order is unknown, does not fit the type's length, or
/// stands beside swap2, swap4 or swap8. The text does not repeat the URI.
std::string withoutByteOrder(const std::string& uri);

}  // namespace values
