// Line settings as the kernel's terminal structures hold them. Pure: no port is touched.
#pragma once

#include <linux/serial.h>
#include <termios.h>

#include <optional>
#include <string>

namespace runtime {

/// What ISerialPort::configure() is given.
struct SerialSettings {
    int baud = 9600;
    int parity = 0;    ///< 0 none, 1 even, 2 odd, 3 mark, 4 space.
    int dataBits = 8;  ///< 7 or 8.
    int stopBits = 1;  ///< 1 or 2.
    int mode = 0;      ///< 0 RS-232, 1 RS-485, 2 RS-422, 3 RS-485P.
};

/// The bits of one character on the wire: start, data, parity and stop bits.
int characterBits(const SerialSettings& settings);

/// @return the kernel's code of a baud rate; nothing for a rate that the run time does not offer.
std::optional<speed_t> speedOf(int baud);

/// @return what is wrong with the settings, e.g. "baud rate 0 is not supported"; empty when they
/// can be used.
std::string settingsFault(const SerialSettings& settings);

/// @return `found` changed to a raw line with these settings: every byte passes as it is, a byte
/// with wrong parity arrives as 0, so that the frame's check sum finds it, and breaks are dropped.
/// REQUIRES: settingsFault() is empty.
termios rawTermios(const termios& found, const SerialSettings& settings);

/// Compares what was asked for with what the driver took over.
/// @param pseudo  A pseudo terminal, which has no character format: it keeps 8 data bits and no
/// parity whatever it is told, so those are not compared.
/// @return what differs, e.g. "parity was not accepted"; empty when nothing does.
std::string differenceIn(const termios& asked, const termios& taken, bool pseudo);

/// True for the modes that need the transmitter switched on and off around each frame.
bool isHalfDuplex(int mode);

/// @return `found` with the kernel's direction control switched on (RTS high while sending) or off,
/// as the mode demands. Delays stay as they were.
serial_rs485 rs485For(const serial_rs485& found, int mode);

}  // namespace runtime
