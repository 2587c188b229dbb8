#include "poll/Failure.h"

#include <array>
#include <string_view>

namespace poll {

namespace {

struct ExceptionRow {
    std::uint8_t code;
    std::string_view text;
};

// The driver answers every exception with one code; only its text tells which.
// Source of the codes: Modbus Application Protocol V1.1b3, 7.
constexpr std::array kExceptions{
    ExceptionRow{1, "Exception: Illegal function"},
    ExceptionRow{2, "Exception: Illegal data address"},
    ExceptionRow{3, "Exception: Illegal data value"},
    ExceptionRow{4, "Exception: Failure in device"},
    ExceptionRow{5, "Exception: server needs more time to finish"},
    ExceptionRow{6, "Exception: server device busy"},
    ExceptionRow{8, "Exception: parity error in target memory"},
    ExceptionRow{10, "Exception: gateway: path to target unavailable"},
    ExceptionRow{11, "Exception: gateway: timeout from target"},
    ExceptionRow{0, "Unknown exception"},
};

FailureKind kindOfException(std::uint8_t code) {
    if (code >= 1 && code <= 3) return FailureKind::Refusal;
    if (code == 10 || code == 11) return FailureKind::Unreached;
    return FailureKind::Exception;
}

Failure ofReply(const ReadError& error) {
    for (const ExceptionRow& row : kExceptions)
        if (row.text == error.text) return {kindOfException(row.code), row.code};
    return {FailureKind::Check};
}

}  // namespace

bool Failure::heard() const {
    return kind == FailureKind::None || kind == FailureKind::Refusal ||
           kind == FailureKind::Exception || kind == FailureKind::Value;
}

bool Failure::againstNode() const {
    return kind == FailureKind::Timeout || kind == FailureKind::Check ||
           kind == FailureKind::Unreached;
}

// The codes are those of IProtocol::GetLastError().
Failure classify(const ReadError& error) {
    switch (error.code) {
        case 0:
            return {FailureKind::None};
        case -4:
            return {FailureKind::Timeout};
        case -6:
            return ofReply(error);
        case -9:
            return {FailureKind::Value};
        default:
            return {FailureKind::NotSent};
    }
}

}  // namespace poll
