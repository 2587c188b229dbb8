// What pages and completions ask of the command line as data.
#include "cli/manual/Manual.h"

#include <array>
#include <string_view>

namespace cli::manual {
namespace {

void append(std::vector<const Command*>& all, const Command& command) {
    all.push_back(&command);
    for (const Command& each : command.commands)
        append(all, each);
}

}  // namespace

bool Option::takesFile() const {
    constexpr std::array<std::string_view, 4> kFiles{"FILE", "PATH", "DEVICE", "PLUGIN"};
    for (const std::string_view word : kFiles)
        if (value.find(word) != std::string::npos) return true;
    return false;
}

std::string Command::joined(const std::string& separator) const {
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() ? "" : separator) + word;
    return text;
}

std::string Command::path() const {
    const std::string all = joined(" ");
    return words.size() < 2 ? "" : all.substr(words.front().size() + 1);
}

std::vector<const Command*> withSubcommands(const Command& top) {
    std::vector<const Command*> all;
    append(all, top);
    return all;
}

std::string shellQuoted(const std::string& text) {
    std::string quoted = "'";
    for (const char c : text)
        quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return quoted + '\'';
}

}  // namespace cli::manual
