// Turns line settings into the kernel's terminal flags and finds what the kernel changed.
#include "runtime/SerialSettings.h"

#include <algorithm>
#include <array>

namespace runtime {
namespace {

struct SpeedRow {
    int baud;
    speed_t code;
};

constexpr std::array kSpeeds{
    SpeedRow{150, B150},     SpeedRow{300, B300},       SpeedRow{600, B600},
    SpeedRow{1200, B1200},   SpeedRow{2400, B2400},     SpeedRow{4800, B4800},
    SpeedRow{9600, B9600},   SpeedRow{19200, B19200},   SpeedRow{38400, B38400},
    SpeedRow{57600, B57600}, SpeedRow{115200, B115200},
};

constexpr tcflag_t kParityBits = PARENB | PARODD | CMSPAR;

/// Row i is parity code i. Mark is "odd, stuck"; space is "even, stuck".
constexpr std::array<tcflag_t, 5> kParities{
    0, PARENB, PARENB | PARODD, PARENB | PARODD | CMSPAR, PARENB | CMSPAR,
};

constexpr int kModes = 4;

std::string unsupported(const char* what, int value) {
    return std::string(what) + " " + std::to_string(value) + " is not supported";
}

tcflag_t formatFlags(const SerialSettings& settings) {
    tcflag_t flags = settings.dataBits == 7 ? CS7 : CS8;
    if (settings.stopBits == 2) flags |= CSTOPB;
    return flags | kParities[static_cast<std::size_t>(settings.parity)];
}

/// Compares all that could change, swallow or hold back a byte.
bool sameTransfer(const termios& asked, const termios& taken) {
    constexpr tcflag_t kInput =
        IGNBRK | BRKINT | IGNPAR | PARMRK | INPCK | ISTRIP | INLCR | IGNCR | ICRNL | IXON | IXOFF;
    constexpr tcflag_t kLocal = ICANON | ECHO | ISIG | IEXTEN;
    return ((asked.c_iflag ^ taken.c_iflag) & kInput) == 0 &&
           ((asked.c_oflag ^ taken.c_oflag) & OPOST) == 0 &&
           ((asked.c_lflag ^ taken.c_lflag) & kLocal) == 0 &&
           asked.c_cc[VMIN] == taken.c_cc[VMIN] && asked.c_cc[VTIME] == taken.c_cc[VTIME];
}

}  // namespace

int characterBits(const SerialSettings& settings) {
    return 1 + settings.dataBits + (settings.parity != 0 ? 1 : 0) + settings.stopBits;
}

std::optional<speed_t> speedOf(int baud) {
    const auto row = std::find_if(kSpeeds.begin(), kSpeeds.end(),
                                  [baud](const SpeedRow& speed) { return speed.baud == baud; });
    if (row == kSpeeds.end()) return std::nullopt;
    return row->code;
}

std::string settingsFault(const SerialSettings& settings) {
    if (!speedOf(settings.baud)) return unsupported("baud rate", settings.baud);
    if (settings.parity < 0 || settings.parity >= static_cast<int>(kParities.size())) {
        return unsupported("parity code", settings.parity);
    }
    if (settings.dataBits != 7 && settings.dataBits != 8) {
        return unsupported("number of data bits", settings.dataBits);
    }
    if (settings.stopBits != 1 && settings.stopBits != 2) {
        return unsupported("number of stop bits", settings.stopBits);
    }
    if (settings.mode < 0 || settings.mode >= kModes) {
        return unsupported("mode code", settings.mode);
    }
    return {};
}

termios rawTermios(const termios& found, const SerialSettings& settings) {
    termios raw = found;
    raw.c_iflag = IGNBRK;
    if (settings.parity != 0) raw.c_iflag |= INPCK;
    raw.c_oflag = 0;
    raw.c_lflag = 0;
    raw.c_cflag &= ~(static_cast<tcflag_t>(CSIZE | CSTOPB | CRTSCTS) | kParityBits);
    raw.c_cflag |= CLOCAL | CREAD | formatFlags(settings);
    // With one byte as the minimum an empty line says EAGAIN, which leaves the answer 0 to mean
    // that the line is gone.
    raw.c_cc[VMIN] = 1;
    raw.c_cc[VTIME] = 0;
    const speed_t speed = *speedOf(settings.baud);
    ::cfsetispeed(&raw, speed);
    ::cfsetospeed(&raw, speed);
    return raw;
}

std::string differenceIn(const termios& asked, const termios& taken, bool pseudo) {
    const tcflag_t changed = asked.c_cflag ^ taken.c_cflag;
    if (::cfgetospeed(&asked) != ::cfgetospeed(&taken)) return "baud rate was not accepted";
    if ((changed & CSTOPB) != 0) return "stop bits were not accepted";
    if (!sameTransfer(asked, taken)) return "raw transfer was not accepted";
    if (pseudo) return {};
    if ((changed & CSIZE) != 0) return "data bits were not accepted";
    if ((changed & kParityBits) != 0) return "parity was not accepted";
    return {};
}

bool isHalfDuplex(int mode) {
    return mode == 1 || mode == 3;
}

serial_rs485 rs485For(const serial_rs485& found, int mode) {
    serial_rs485 wanted = found;
    if (!isHalfDuplex(mode)) {
        wanted.flags &= ~static_cast<__u32>(SER_RS485_ENABLED);
        return wanted;
    }
    wanted.flags |= SER_RS485_ENABLED | SER_RS485_RTS_ON_SEND;
    wanted.flags &= ~static_cast<__u32>(SER_RS485_RTS_AFTER_SEND | SER_RS485_RX_DURING_TX);
    return wanted;
}

}  // namespace runtime
