// The line settings in force and the words and numbers that stand for them.
#pragma once

#include <string_view>

namespace _MRTU {

/// What the port is set to.
struct LineSettings {
    int baud = 0;
    int dataBits = 8;
    int stopBits = 1;
    int parity = 0;  ///< 0 none, 1 even, 2 odd, 3 mark, 4 space.
    int mode = 0;    ///< 0 RS-232, 1 RS-485, 2 RS-422, 3 RS-485P.
    int gapMs = 1;   ///< Silence that ends a received frame.
};

/// @return the inter-character gap in ms: 120000 / baud rounded up, at least 1; 1 for baud 0.
int interCharacterGap(int baud);

/// @return the code of a configured word, -1 when there is none; takes no memory. The parity word
/// is compared without regard to case. The configuration knows fewer words than the report has
/// codes for.
int parityCode(std::string_view word);
int modeCode(std::string_view word);

/// @return the word for a code, for any code: what is unknown is "none" and "RS-232".
const char* parityWord(int code);
const char* modeWord(int code);

/// What may be set at run time: the listed baud rates, every parity that has a word, 1 or 2 stop
/// bits, and the modes that can be configured.
bool isListedBaudRate(int baud);
bool isListedParity(int code);
bool isListedStopBits(int bits);
bool isListedMode(int code);

}  // namespace _MRTU
