// The conversions. Items are little-endian, so every one works byte by byte.
#include "framework/Conversions.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <string_view>

#include "framework/DataTypes.h"
#include "framework/Swaps.h"

namespace ProtUtilsN {

namespace {

using Bytes = unsigned char*;

bool swapNibble(Bytes buf, const ConversionShape& shape, bool /*toDevice*/) {
    for (int i = 0; i < shape.length; ++i) {
        buf[i] = static_cast<unsigned char>((buf[i] << 4 | buf[i] >> 4) & 0xFF);
    }
    return true;
}

template <int Group>
bool swapGroups(Bytes buf, const ConversionShape& shape, bool /*toDevice*/) {
    if (shape.length < 1) return true;
    if (shape.length % Group != 0) return false;
    for (int i = 0; i < shape.length; i += Group) {
        std::reverse(buf + i, buf + i + Group);
    }
    return true;
}

// Each byte from two decimal digits to the number 0..99 that they are.
bool pairsFromBcd(Bytes item, int size) {
    for (int k = 0; k < size; ++k) {
        const int low = item[k] & 0x0F;
        const int high = item[k] >> 4;
        if (low > 9 || high > 9) return false;
        item[k] = static_cast<unsigned char>(low + 10 * high);
    }
    return true;
}

// Horner's rule in place: the number in the bytes behind `k`, times 100, plus byte k. It needs no
// integer as wide as the item, so the ten bytes of a time fit as well.
void binaryFromPairs(Bytes item, int size) {
    for (int k = size - 2; k >= 0; --k) {
        unsigned carry = item[k];
        for (int i = k; i < size; ++i) {
            const unsigned next = i + 1 < size ? item[i + 1] : 0U;
            const unsigned sum = next * 100U + carry;
            item[i] = static_cast<unsigned char>(sum & 0xFFU);
            carry = sum >> 8;
        }
    }
}

bool fromBcd(Bytes item, int size) {
    if (!pairsFromBcd(item, size)) return false;
    binaryFromPairs(item, size);
    return true;
}

// The largest number of one to four bytes of decimal digits.
constexpr std::array<std::uint32_t, 5> kBcdLimits = {0, 99, 9999, 999999, 99999999};
constexpr int kWidestBcd = static_cast<int>(kBcdLimits.size()) - 1;

bool toBcd(Bytes item, int size) {
    std::uint32_t value = 0;
    for (int k = size - 1; k >= 0; --k) {
        value = value << 8 | item[k];
    }
    if (value > kBcdLimits[static_cast<std::size_t>(size)]) return false;

    for (int k = 0; k < size; ++k) {
        item[k] = static_cast<unsigned char>(value % 10 | (value / 10 % 10) << 4);
        value /= 100;
    }
    return true;
}

bool bcd(Bytes buf, const ConversionShape& shape, bool toDevice) {
    const int size = shape.itemLength;
    if (toDevice && size > kWidestBcd) return false;
    if (size < 1) return true;  // such items have no digits
    for (int i = 0; i + size <= shape.length; i += size) {
        if (!(toDevice ? toBcd(buf + i, size) : fromBcd(buf + i, size))) return false;
    }
    return true;
}

// Two's complement: all bits inverted, plus one.
void negateInteger(Bytes item, int size) {
    unsigned carry = 1;
    for (int k = 0; k < size; ++k) {
        const unsigned sum = (~unsigned{item[k]} & 0xFFU) + carry;
        item[k] = static_cast<unsigned char>(sum & 0xFFU);
        carry = sum >> 8;
    }
}

void flipSign(Bytes item, int size) {
    item[size - 1] = static_cast<unsigned char>(item[size - 1] ^ 0x80U);
}

struct NegationRow {
    ICU_Type type;
    int size;
    void (*negate)(Bytes item, int size);
};

constexpr std::array kNegations{
    NegationRow{ICU_Type::byte, 1, negateInteger}, NegationRow{ICU_Type::short_, 2, negateInteger},
    NegationRow{ICU_Type::int_, 4, negateInteger}, NegationRow{ICU_Type::int64, 8, negateInteger},
    NegationRow{ICU_Type::float_, 4, flipSign},    NegationRow{ICU_Type::double_, 8, flipSign},
};

// The walk counts bytes and ends at the number of *items*: of an array of wider items it reaches
// only the front part (5 of 10 shorts, 3 of 10 ints). Deployed projects rely on it.
bool neg(Bytes buf, const ConversionShape& shape, bool /*toDevice*/) {
    const auto* row =
        std::find_if(kNegations.begin(), kNegations.end(),
                     [&shape](const auto& each) { return each.type == shape.itemType; });
    if (row == kNegations.end()) return false;

    for (int i = 0; i < shape.itemCount && i + row->size <= shape.length; i += row->size) {
        row->negate(buf + i, row->size);
    }
    return true;
}

bool invertsBytes(ICU_Type type) {
    constexpr std::array kUnsigned = {ICU_Type::unsignedByte, ICU_Type::unsignedShort,
                                      ICU_Type::unsignedInt, ICU_Type::binary, ICU_Type::uint64};
    return std::find(kUnsigned.begin(), kUnsigned.end(), type) != kUnsigned.end();
}

bool inv(Bytes buf, const ConversionShape& shape, bool /*toDevice*/) {
    const bool bits = IsBitType(shape.itemType);
    if (!bits && !invertsBytes(shape.itemType)) return false;
    for (int i = 0; i < shape.length; ++i) {
        buf[i] = static_cast<unsigned char>(bits ? (buf[i] == 0 ? 1 : 0) : buf[i] ^ 0xFF);
    }
    return true;
}

struct ConversionRow {
    std::string_view name;
    bool (*apply)(Bytes buf, const ConversionShape& shape, bool toDevice);
};

constexpr std::array kConversions{
    ConversionRow{"swapnibble", swapNibble},
    ConversionRow{kSwaps[0].name, swapGroups<kSwaps[0].width>},
    ConversionRow{kSwaps[1].name, swapGroups<kSwaps[1].width>},
    ConversionRow{kSwaps[2].name, swapGroups<kSwaps[2].width>},
    ConversionRow{"bcd", bcd},
    ConversionRow{"neg", neg},
    ConversionRow{"inv", inv},
};

}  // namespace

bool applyConversion(unsigned char* buf, const char* name, const ConversionShape& shape,
                     bool toDevice) {
    if (name == nullptr) return false;
    const std::string_view wanted(name);
    const auto* row = std::find_if(kConversions.begin(), kConversions.end(),
                                   [wanted](const auto& each) { return each.name == wanted; });
    return row != kConversions.end() && row->apply(buf, shape, toDevice);
}

}  // namespace ProtUtilsN
