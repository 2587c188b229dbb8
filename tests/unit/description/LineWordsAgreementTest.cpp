// What each layer knows of a serial line: the description offers it, the driver takes it, the port
// can be set to it, and the command has a word for it. Who adds a baud rate in one place and not in
// another sees it here.
#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <string>
#include <vector>

#include "cli/override/OverrideWords.h"
#include "mrtu/LineSettings.h"
#include "runtime/SerialSettings.h"
#include "tests/unit/description/Document.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace description_test {
namespace {

using Words = std::vector<std::string>;

/// What the configuration tools offer for a parameter.
Words offered(const std::string& parameter) {
    return childTexts(childWithText(root().child("parameters"), parameter));
}

const cli::SerialSetting& overridable(const std::string& name) {
    const auto settings = cli::serialSettings();
    const auto setting =
        std::find_if(settings.begin(), settings.end(),
                     [&](const cli::SerialSetting& each) { return each.name == name; });
    if (setting == settings.end()) throw std::invalid_argument(name);
    return *setting;
}

Words wordsOf(const std::string& name) {
    Words words;
    for (const cli::SettingWord& word : overridable(name).words)
        words.emplace_back(word.word);
    return words;
}

bool portTakes(const runtime::SerialSettings& settings) {
    return runtime::settingsFault(settings).empty();
}

/// The numbers from -1 to `last` that `takes` accepts.
template <class Takes>
std::vector<int> accepted(int last, Takes takes) {
    std::vector<int> numbers;
    for (int number = -1; number <= last; ++number)
        if (takes(number)) numbers.push_back(number);
    return numbers;
}

std::vector<int> numbersOf(const Words& words) {
    std::vector<int> numbers;
    for (const std::string& word : words)
        numbers.push_back(std::stoi(word));
    return numbers;
}

using LineWordsAgreementTest = driver_test::DriverTest;

TEST_F(LineWordsAgreementTest, BaudRatesAreTheSameEverywhere) {
    constexpr int kFast = 4'000'000;
    const std::vector<int> rates = numbersOf(offered("baudrate"));
    EXPECT_EQ(11U, rates.size());
    EXPECT_EQ(rates, accepted(kFast, _MRTU::isListedBaudRate));
    EXPECT_EQ(rates, accepted(kFast, [](int baud) { return runtime::speedOf(baud).has_value(); }));
    EXPECT_EQ(rates, numbersOf(wordsOf("baud")));
    for (const cli::SettingWord& word : overridable("baud").words)
        EXPECT_EQ(std::to_string(word.code), word.word);
}

TEST_F(LineWordsAgreementTest, ParityWordsStandForTheSameCodes) {
    for (const cli::SettingWord& word : overridable("parity").words)
        EXPECT_EQ(word.word, _MRTU::parityWord(static_cast<int>(word.code)));
    // The tools offer fewer than the driver takes, and the driver's configuration fewer than codes.
    EXPECT_EQ((Words{"none", "even", "odd"}), offered("parity"));
    for (const std::string word : {"none", "even", "odd", "mark"})
        EXPECT_EQ(word, _MRTU::parityWord(_MRTU::parityCode(word)));
    EXPECT_EQ((Words{"none", "even", "odd", "mark", "space"}), wordsOf("parity"));
}

TEST_F(LineWordsAgreementTest, PortTakesEveryParityThatHasAWord) {
    std::vector<int> codes;
    for (const cli::SettingWord& word : overridable("parity").words)
        codes.push_back(static_cast<int>(word.code));
    EXPECT_EQ(codes, accepted(9, [](int parity) { return portTakes({.parity = parity}); }));
}

TEST_F(LineWordsAgreementTest, ModesAreTheSameEverywhere) {
    EXPECT_EQ(offered("mode"), wordsOf("mode"));
    for (const cli::SettingWord& word : overridable("mode").words) {
        EXPECT_EQ(static_cast<int>(word.code), _MRTU::modeCode(word.word));
        EXPECT_EQ(word.word, _MRTU::modeWord(static_cast<int>(word.code)));
    }
    // One mode more can only come from a storage: it has a word for reports.
    EXPECT_EQ((std::vector<int>{0, 1, 2, 3}),
              accepted(9, [](int mode) { return portTakes({.mode = mode}); }));
    EXPECT_STREQ("RS-485P", _MRTU::modeWord(3));
}

TEST_F(LineWordsAgreementTest, StopBitsAndDataBitsAreTheSameEverywhere) {
    const std::vector<int> stopBits = numbersOf(offered("stopbits"));
    EXPECT_EQ(stopBits, numbersOf(wordsOf("stop")));
    EXPECT_EQ(stopBits, accepted(9, [](int bits) { return portTakes({.stopBits = bits}); }));
    EXPECT_EQ(numbersOf(offered("bits")),
              accepted(9, [](int bits) { return portTakes({.dataBits = bits}); }));
}

TEST_F(LineWordsAgreementTest, AreasThatStageSettingsAreDescribed) {
    for (const cli::SerialSetting& setting : cli::serialSettings()) {
        const auto area = childWithText(root().child("memtypes"), std::string(setting.area));
        EXPECT_FALSE(area.empty()) << setting.area;
    }
}

TEST_F(LineWordsAgreementTest, DriverStagesExactlyWhatHasAWord) {
    start();
    for (const std::string name : {"parity", "stop", "mode"}) {
        const cli::SerialSetting& setting = overridable(name);
        std::vector<int> codes;
        for (const cli::SettingWord& word : setting.words)
            codes.push_back(static_cast<int>(word.code));
        const std::string uri =
            "1?" + std::string(setting.area) + "?0?" + std::string(setting.type);
        EXPECT_EQ(codes,
                  accepted(255, [&](int code) { return code >= 0 && writeByte(uri, code) != 0; }))
            << name;
    }
    const cli::SerialSetting& baud = overridable("baud");
    const std::string uri = "1?" + std::string(baud.area) + "?0?" + std::string(baud.type);
    for (const cli::SettingWord& word : baud.words)
        EXPECT_NE(0, writeNumber(uri, static_cast<std::int32_t>(word.code))) << word.word;
    EXPECT_EQ(0, writeNumber(uri, 14400));
}

}  // namespace
}  // namespace description_test
