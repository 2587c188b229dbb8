// Reads the words of an override, and the table of serial settings with their codes.
#include "cli/override/OverrideWords.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <array>
#include <charconv>

#include "cli/Choices.h"
#include "cli/ExitCode.h"
#include "settings/NodeNumbers.h"

namespace cli {
namespace {

constexpr std::array kBauds{
    SettingWord{"150", 150},     SettingWord{"300", 300},      SettingWord{"600", 600},
    SettingWord{"1200", 1200},   SettingWord{"2400", 2400},    SettingWord{"4800", 4800},
    SettingWord{"9600", 9600},   SettingWord{"19200", 19200},  SettingWord{"38400", 38400},
    SettingWord{"57600", 57600}, SettingWord{"115200", 115200}};
constexpr std::array kParities{SettingWord{"none", 0}, SettingWord{"even", 1},
                               SettingWord{"odd", 2}, SettingWord{"mark", 3},
                               SettingWord{"space", 4}};
constexpr std::array kStops{SettingWord{"1", 1}, SettingWord{"2", 2}};
constexpr std::array kModes{SettingWord{"RS-232", 0}, SettingWord{"RS-485", 1},
                            SettingWord{"RS-422", 2}};

constexpr std::array kSettings{SerialSetting{"baud", "SP_Baud", "unsignedInt", kBauds},
                               SerialSetting{"parity", "SP_Par", "unsignedByte", kParities},
                               SerialSetting{"stop", "SP_Stop", "unsignedByte", kStops},
                               SerialSetting{"mode", "SP_Mode", "unsignedByte", kModes}};

[[noreturn]] void refuse(std::string_view word, std::string_view why) {
    throw CommandError(ExitCode::Usage, fmt::format("'{}': {}", word, why));
}

int parseNumber(std::string_view whole, std::string_view digits, int largest) {
    int number = 0;
    const char* const end = digits.data() + digits.size();
    const auto [stop, error] = std::from_chars(digits.data(), end, number);
    if (error != std::errc{} || stop != end || number < 0 || number > largest) {
        refuse(whole, fmt::format("'{}' is no number from 0 to {}", digits, largest));
    }
    return number;
}

const SerialSetting* settingOf(std::string_view name) {
    for (const SerialSetting& setting : kSettings) {
        if (setting.name == name) return &setting;
    }
    return nullptr;
}

std::uint32_t codeOf(std::string_view whole, const SerialSetting& setting, std::string_view text) {
    std::vector<std::string> known;
    for (const SettingWord& word : setting.words) {
        if (sameWord(word.word, text)) return word.code;
        known.emplace_back(word.word);
    }
    refuse(whole, fmt::format("{} is one of {}{}", setting.name, fmt::join(known, ", "),
                              didYouMean(text, known)));
}

std::uint8_t parseAddress(std::string_view whole, std::string_view text) {
    if (text == "off") return std::uint8_t{settings::kNodeOff};
    return static_cast<std::uint8_t>(parseNumber(whole, text, settings::kNodeOff));
}

bool parseOnOff(std::string_view whole, std::string_view text) {
    if (text == "on") return true;
    if (text == "off") return false;
    refuse(whole, "Modicon mode is on or off");
}

/// @return what words can begin with.
std::vector<std::string> subjects() {
    std::vector<std::string> names{"node", "modicon"};
    for (const SerialSetting& setting : kSettings)
        names.emplace_back(setting.name);
    return names;
}

enum class Subject : std::uint8_t { None, Node, Modicon };

/// "node" and "modicon" tell what the numbers behind them are about.
bool takeSubject(const std::string& word, Subject& subject) {
    if (word == "node") subject = Subject::Node;
    if (word == "modicon") subject = Subject::Modicon;
    return word == "node" || word == "modicon";
}

void addChange(OverrideChanges& changes, const std::string& word, Subject subject) {
    const std::size_t equals = word.find('=');
    if (equals == std::string::npos) refuse(word, "expected node, modicon or SETTING=VALUE");
    const std::string_view left = std::string_view(word).substr(0, equals);
    const std::string_view right = std::string_view(word).substr(equals + 1);
    if (const SerialSetting* const setting = settingOf(left)) {
        changes.serial.push_back({setting, codeOf(word, *setting, right)});
    } else if (subject == Subject::Node) {
        changes.nodes.push_back(
            {parseNumber(word, left, settings::kNodeOff), parseAddress(word, right)});
    } else if (subject == Subject::Modicon) {
        changes.modicon.push_back(
            {parseNumber(word, left, settings::kNodeOff), parseOnOff(word, right)});
    } else {
        refuse(word, "the settings are baud, parity, stop and mode; nodes go as 'node N=M'" +
                         didYouMean(left, subjects()));
    }
}

void addRemoval(OverrideRemovals& removals, const std::string& word, Subject subject) {
    if (const SerialSetting* const setting = settingOf(word)) {
        removals.serial.push_back(setting);
    } else if (subject == Subject::Node) {
        removals.nodes.push_back(parseNumber(word, word, settings::kNodeOff));
    } else if (subject == Subject::Modicon) {
        removals.modicon.push_back(parseNumber(word, word, settings::kNodeOff));
    } else {
        refuse(word, "expected node N, modicon N, baud, parity, stop, mode or all" +
                         didYouMean(word, subjects()));
    }
}

}  // namespace

std::span<const SerialSetting> serialSettings() {
    return kSettings;
}

std::string wordOf(const SerialSetting& setting, std::uint32_t code) {
    for (const SettingWord& word : setting.words) {
        if (word.code == code) return std::string(word.word);
    }
    return std::to_string(code);
}

std::string addressWord(std::uint32_t address) {
    return address == settings::kNodeOff ? "off" : std::to_string(address);
}

OverrideChanges parseChanges(const std::vector<std::string>& words) {
    OverrideChanges changes;
    Subject subject = Subject::None;
    bool awaited = false;
    for (const std::string& word : words) {
        if (awaited && word.find('=') == std::string::npos) refuse(word, "expected N=VALUE here");
        awaited = takeSubject(word, subject);
        if (!awaited) addChange(changes, word, subject);
    }
    if (awaited) refuse(words.back(), "a node number and its value must follow, e.g. 5=7");
    return changes;
}

OverrideRemovals parseRemovals(const std::vector<std::string>& words) {
    OverrideRemovals removals;
    if (words.size() == 1 && words.front() == "all") {
        removals.all = true;
        return removals;
    }
    Subject subject = Subject::None;
    bool awaited = false;
    for (const std::string& word : words) {
        awaited = takeSubject(word, subject);
        if (!awaited) addRemoval(removals, word, subject);
    }
    if (awaited) refuse(words.back(), "a node number must follow");
    return removals;
}

}  // namespace cli
