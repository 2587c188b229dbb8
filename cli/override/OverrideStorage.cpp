// Opens the storage for a command and judges what stands in it.
#include "cli/override/OverrideStorage.h"

#include <fmt/format.h>

#include <algorithm>
#include <optional>

#include "cli/override/OverrideKeys.h"
#include "cli/override/OverrideWords.h"
#include "runtime/SqliteStorage.h"
#include "settings/NodeNumbers.h"
#include "settings/NumberText.h"

namespace cli {
namespace {

using runtime::SqliteStorage;
using runtime::StorageError;
using runtime::StorageFault;

constexpr const char* kGoWithout = "--storage none does without";

/// A number as the driver reads it, but all of the text.
std::optional<long> wholeNumber(const std::string& text) {
    const settings::NumberReading reading = settings::readNumber(text);
    if (reading.partial) return std::nullopt;
    return reading.value;
}

std::string addressFault(const std::string& node, const std::string& text) {
    const auto number = wholeNumber(node);
    if (!number || *number < 0) return fmt::format("'{}' is no node", node);
    const auto address = wholeNumber(text);
    if (address && *address >= 0 && *address <= settings::kNodeOff) return {};
    return fmt::format("'{}' is no address from 0 to {}", text, settings::kNodeOff);
}

std::string settingFault(const SerialSetting& setting, const std::string& text) {
    const auto number = wholeNumber(text);
    const bool known =
        number && std::any_of(setting.words.begin(), setting.words.end(),
                              [&](const SettingWord& word) { return word.code == *number; });
    return known ? "" : fmt::format("'{}' is no {}", text, setting.name);
}

/// Without a file there is no override that could be lost.
std::unique_ptr<runtime::Storage> goWithout(CommandContext& context, StorageNeed need,
                                            const std::string& why) {
    const std::string text = fmt::format("overrides are not kept: {}", why);
    if (need == StorageNeed::Keep) throw CommandError(ExitCode::Other, text);
    complain(context, fmt::format("{}; {}", text, kGoWithout));
    return nullptr;
}

}  // namespace

std::string overrideFault(const std::string& key, const runtime::StoredValue& value) {
    const std::string text = runtime::storedText(value);
    if (const auto node = addressNumber(key)) return addressFault(*node, text);
    if (isModiconKey(key)) {
        const bool flag = text == "0" || text == "1" || text == "true" || text == "false";
        return flag ? "" : fmt::format("'{}' is neither 0 nor 1", text);
    }
    for (const SerialSetting& setting : serialSettings()) {
        if (key == setting.name) return settingFault(setting, text);
    }
    return {};
}

std::unique_ptr<runtime::Storage> openOverrides(CommandContext& context, const LineOptions& options,
                                                StorageNeed need) {
    const bool none = options.storage.empty() ? options.sim : options.storage == "none";
    if (none) return nullptr;
    const std::string path =
        options.storage.empty() ? runtime::defaultStoragePath() : options.storage;
    if (path.empty()) return goWithout(context, need, "HOME is not set; --storage FILE names one");
    auto opened = SqliteStorage::open(path, SqliteStorage::kBusyTimeoutMs, overrideFault);
    if (!opened) {
        const StorageError& error = opened.error();
        if (error.fault == StorageFault::NoDirectory) return goWithout(context, need, error.text);
        throw CommandError(ExitCode::Other, fmt::format("{}; {}", error.text, kGoWithout));
    }
    const std::string whyReadOnly = opened.value()->whyReadOnly();
    if (!whyReadOnly.empty() && need == StorageNeed::Use) {
        complain(context, fmt::format("{}: overrides can only be read ({}); {}", path, whyReadOnly,
                                      kGoWithout));
    }
    return std::move(opened).value();
}

void reportUnused(CommandContext& context, runtime::Storage& storage, const std::string& section) {
    constexpr std::size_t kShown = 10;
    const auto unused = storage.unused(section);
    for (std::size_t i = 0; i < std::min(kShown, unused.size()); ++i) {
        complain(context,
                 fmt::format("stored override {} is not used: {}", unused[i].key, unused[i].why));
    }
    if (unused.size() > kShown) {
        complain(context, fmt::format("{} more are not used", unused.size() - kShown));
    }
    if (!unused.empty()) complain(context, "'mrtu override clear' takes out what is not used");
}

}  // namespace cli
