#include "wire/Lengths.h"

#include "wire/FunctionCodes.h"

namespace wire {

std::optional<std::uint16_t> addressOfRequest(ByteView firstBytes) {
    if (firstBytes.size() < 1 + 1 + 2) return std::nullopt;
    return static_cast<std::uint16_t>(firstBytes[2] << 8U | firstBytes[3]);
}

std::optional<std::size_t> lengthOfRequest(ByteView firstBytes, bool longAt) {
    constexpr std::size_t kByteCount = 1 + 1 + 2 + 2;  // Behind node, function, address, count.
    constexpr std::size_t kFixed = kByteCount + 2;     // With the check.
    if (!addressOfRequest(firstBytes)) return std::nullopt;
    const FunctionRow* const row = functionRow(firstBytes[1]);
    if (row == nullptr) return std::nullopt;
    if (row->form == Form::WriteWord && longAt) return kFixed + 2;
    if (isRead(row->form) || isSingleWrite(row->form)) return kFixed;
    if (firstBytes.size() <= kByteCount) return std::nullopt;
    return kFixed + 1 + firstBytes[kByteCount];
}

}  // namespace wire
