// Overrides in the words of people. Pure.
#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace cli {

struct SettingWord {
    std::string_view word;
    std::uint32_t code;
};

/// One serial setting that can be overridden.
struct SerialSetting {
    std::string_view name;  ///< Also its key in the storage.
    std::string_view area;  ///< The memory type that stages it.
    std::string_view type;  ///< That memory's data type.
    std::span<const SettingWord> words;
};

/// baud, parity, stop, mode.
std::span<const SerialSetting> serialSettings();

/// @return the word for a code, the number itself when there is none.
std::string wordOf(const SerialSetting& setting, std::uint32_t code);

/// A slave address as people write it: 255 takes a node off the line.
std::string addressWord(std::uint32_t address);

struct NodeChange {
    int node;
    std::uint8_t address;
};
struct ModiconChange {
    int node;
    bool on;
};
struct SerialChange {
    const SerialSetting* setting;
    std::uint32_t code;
};

struct OverrideChanges {
    std::vector<NodeChange> nodes;
    std::vector<ModiconChange> modicon;
    std::vector<SerialChange> serial;
};

/// Reads "node 5=7 6=off modicon 5=on baud=38400 parity=even stop=2 mode=RS-485", in any order.
/// Case does not count in parity and mode.
/// Errors: CommandError (Usage) naming the word and what would be accepted.
OverrideChanges parseChanges(const std::vector<std::string>& words);

struct OverrideRemovals {
    std::vector<int> nodes;
    std::vector<int> modicon;
    std::vector<const SerialSetting*> serial;
    bool all = false;
};

/// Reads "node 5 6 modicon 5 baud parity stop mode", in any order, or "all".
/// Errors: CommandError (Usage).
OverrideRemovals parseRemovals(const std::vector<std::string>& words);

}  // namespace cli
