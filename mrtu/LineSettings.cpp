#include "mrtu/LineSettings.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <functional>

namespace _MRTU {

namespace {

struct Word {
    const char* text;
    bool configurable;  ///< Codes that are not come from run-time overrides only.
};

// Row i stands for code i.
constexpr std::array kParityWords{Word{"none", true}, Word{"even", true}, Word{"odd", true},
                                  Word{"mark", true}, Word{"space", false}};
constexpr std::array kModeWords{Word{"RS-232", true}, Word{"RS-485", true}, Word{"RS-422", true},
                                Word{"RS-485P", false}};

constexpr std::array kListedBaudRates{150,  300,   600,   1200,  2400,  4800,
                                      9600, 19200, 38400, 57600, 115200};

constexpr std::array kListedStopBits{1, 2};

template <class List>
bool holds(const List& list, int number) {
    return std::find(list.begin(), list.end(), number) != list.end();
}

template <std::size_t Count, class Same>
int codeOf(const std::array<Word, Count>& words, std::string_view word, Same same) {
    for (std::size_t code = 0; code < Count; ++code)
        if (words[code].configurable && same(word, words[code].text)) return static_cast<int>(code);
    return -1;
}

template <std::size_t Count>
bool isCode(const std::array<Word, Count>& /*words*/, int code) {
    return code >= 0 && code < static_cast<int>(Count);
}

template <std::size_t Count>
const char* wordOf(const std::array<Word, Count>& words, int code) {
    return words[isCode(words, code) ? static_cast<std::size_t>(code) : 0].text;
}

char lowered(char letter) {
    return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

bool sameWhenLowered(std::string_view word, std::string_view lowerCase) {
    return std::equal(word.begin(), word.end(), lowerCase.begin(), lowerCase.end(),
                      [](char letter, char wanted) { return lowered(letter) == wanted; });
}

}  // namespace

int interCharacterGap(int baud) {
    // A rate of 0 cannot open a port; here it must not divide.
    if (baud == 0) return 1;
    const long long gap = (static_cast<long long>(baud) + 119999) / baud;
    return gap > 0 ? static_cast<int>(gap) : 1;
}

int parityCode(std::string_view word) {
    return codeOf(kParityWords, word, sameWhenLowered);
}

int modeCode(std::string_view word) {
    return codeOf(kModeWords, word, std::equal_to<std::string_view>());
}

const char* parityWord(int code) {
    return wordOf(kParityWords, code);
}

const char* modeWord(int code) {
    return wordOf(kModeWords, code);
}

bool isListedBaudRate(int baud) {
    return holds(kListedBaudRates, baud);
}

bool isListedParity(int code) {
    return isCode(kParityWords, code);
}

bool isListedStopBits(int bits) {
    return holds(kListedStopBits, bits);
}

bool isListedMode(int code) {
    return isCode(kModeWords, code) && kModeWords[static_cast<std::size_t>(code)].configurable;
}

}  // namespace _MRTU
