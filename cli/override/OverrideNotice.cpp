// Tells of overrides in force that neither command line nor configuration shows.
#include "cli/override/OverrideNotice.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <optional>

#include "cli/Choices.h"
#include "cli/override/OverrideKeys.h"
#include "cli/override/OverrideWords.h"
#include "runtime/StoragePath.h"
#include "runtime/StoredValue.h"
#include "settings/ConfigText.h"
#include "settings/NumberText.h"

namespace cli {
namespace {

/// More of them are no line that anybody reads.
constexpr std::size_t kMostNamed = 8;

/// The configuration's key of a serial setting.
std::string_view configKeyOf(const SerialSetting& setting) {
    if (setting.name == "baud") return "baudrate";
    if (setting.name == "stop") return "stopbits";
    return setting.name;
}

bool isOneBased(const std::string& model) {
    return model == "1" || model == "3";
}

/// A node counts from 1 only where its own model and that of all nodes do.
bool configuredModicon(std::string_view configText, int node) {
    return isOneBased(settings::modelOf(configText, node)) &&
           isOneBased(settings::itemOf(configText, "model").value_or("1"));
}

std::optional<ActiveOverride> serialOverride(const SerialSetting& setting,
                                             const runtime::StoredEntry& entry,
                                             std::string_view configText) {
    const std::string configured = settings::itemOf(configText, configKeyOf(setting)).value_or("");
    const std::string stored =
        wordOf(setting, static_cast<std::uint32_t>(runtime::storedInt(entry.value)));
    if (sameWord(stored, configured)) return std::nullopt;
    const std::string name(setting.name);
    return ActiveOverride{fmt::format("{} {} instead of {}", name, stored, configured), name};
}

std::optional<ActiveOverride> addressOverride(int node, const runtime::StoredEntry& entry) {
    const long address = settings::readNumber(runtime::storedText(entry.value)).value;
    if (address == node) return std::nullopt;
    const std::string word = addressWord(static_cast<std::uint32_t>(address));
    return ActiveOverride{fmt::format("node {} = {}", node, word), fmt::format("node {}", node)};
}

std::optional<ActiveOverride> modiconOverride(int node, const runtime::StoredEntry& entry,
                                              std::string_view configText) {
    const bool on = runtime::storedBool(entry.value);
    if (on == configuredModicon(configText, node)) return std::nullopt;
    return ActiveOverride{fmt::format("modicon {} = {}", node, on ? "on" : "off"),
                          fmt::format("modicon {}", node)};
}

std::optional<ActiveOverride> overrideOf(const runtime::StoredEntry& entry,
                                         std::string_view configText) {
    for (const SerialSetting& setting : serialSettings()) {
        if (entry.key == setting.name) return serialOverride(setting, entry, configText);
    }
    if (const auto node = nodeOfModiconKey(entry.key))
        return modiconOverride(*node, entry, configText);
    if (const auto node = nodeOfAddressKey(entry.key)) return addressOverride(*node, entry);
    return std::nullopt;
}

std::string shellWord(const std::string& text) {
    constexpr std::string_view kPlain =
        "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_-./:=@+";
    if (!text.empty() && text.find_first_not_of(kPlain) == std::string::npos) return text;
    std::string quoted = "'";
    for (const char c : text)
        quoted += c == '\'' ? "'\\''" : std::string(1, c);
    return quoted + "'";
}

/// @return the command that takes these overrides away.
std::string clearCommand(const std::vector<ActiveOverride>& overrides, const LineOptions& options) {
    std::string command = "mrtu override clear";
    if (!options.storage.empty()) command += " --storage " + shellWord(options.storage);
    if (!options.ident.empty()) command += " --ident " + shellWord(options.ident);
    if (overrides.size() > kMostNamed) return command + " all";
    for (const ActiveOverride& each : overrides)
        command += ' ' + each.words;
    return command;
}

std::string listOf(const std::vector<ActiveOverride>& overrides) {
    std::vector<std::string_view> texts;
    for (std::size_t i = 0; i < std::min(overrides.size(), kMostNamed); ++i)
        texts.push_back(overrides[i].text);
    const std::size_t more = overrides.size() - texts.size();
    return fmt::format("{}{}", fmt::join(texts, ", "),
                       more == 0 ? "" : fmt::format(" and {} more", more));
}

}  // namespace

std::vector<ActiveOverride> activeOverrides(const std::vector<runtime::StoredEntry>& entries,
                                            std::string_view configText) {
    std::vector<ActiveOverride> active;
    for (const runtime::StoredEntry& entry : entries) {
        if (auto found = overrideOf(entry, configText)) active.push_back(std::move(*found));
    }
    return active;
}

void announceOverrides(CommandContext& context, Session& session, const LineOptions& options) {
    if (session.storage() == nullptr) return;
    const std::string ident = session.channel().protocol().GetIdent();
    const auto active = activeOverrides(session.storage()->entries(ident), session.configText());
    if (active.empty()) return;
    const std::string file =
        options.storage.empty() ? runtime::defaultStoragePath() : options.storage;
    complain(context,
             fmt::format("stored overrides of '{}'{} are in force: {}; {} holds them, '{}' clears "
                         "them",
                         ident, options.ident.empty() ? " (all lines without --ident)" : "",
                         listOf(active), file, clearCommand(active, options)));
}

}  // namespace cli
