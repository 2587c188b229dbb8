#include "lint/LintConfig.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <charconv>
#include <set>

#include "lint/NodeNumber.h"
#include "settings/NumberText.h"
#include "values/NearestName.h"

namespace lint {
namespace {

using settings::Description;
using settings::ParameterInfo;
using settings::ScannedConfig;
using settings::ScannedItem;

/// What a rule looks at.
struct Item {
    const ScannedConfig& config;
    const Description& description;
    const ScannedItem& word;
    const ParameterInfo* parameter;  ///< Null for an unknown key.
};

std::string choicesText(const ParameterInfo& parameter) {
    return fmt::format("choices: {}", fmt::join(parameter.choices, ", "));
}

std::vector<std::string> keysOf(const Description& description) {
    std::vector<std::string> keys;
    for (const ParameterInfo& parameter : description.parameters)
        keys.push_back(parameter.key);
    return keys;
}

std::vector<std::string> modelsOf(const Description& description) {
    std::vector<std::string> names;
    for (const settings::ModelInfo& model : description.models)
        names.push_back(model.name);
    return names;
}

void notAnItem(const Item& item, Findings& out) {
    if (item.word.value) return;
    warn(out, "not-an-item", item.word.place,
         fmt::format("'{}' is no key=value and is skipped", item.word.word),
         "a blank inside a value is written '&nbsp;'; there are none around '='");
}

void unknownKey(const Item& item, Findings& out) {
    if (!item.word.value || item.parameter != nullptr) return;
    const std::string nearest = values::nearestName(item.word.key, keysOf(item.description));
    warn(out, "unknown-key", item.word.place, fmt::format("unknown key '{}'", item.word.key),
         nearest.empty() ? "'mrtu describe parameters' lists the keys"
                         : fmt::format("did you mean '{}'?", nearest));
}

void duplicateKey(const Item& item, Findings& out) {
    if (!item.word.value) return;
    const ScannedItem* first = item.config.item(item.word.name);
    if (first == &item.word) return;
    warn(out, "duplicate-key", item.word.place,
         fmt::format("'{}' is given twice; the first value, '{}' in line {}, counts",
                     item.word.name, *first->value, first->place.line),
         "remove one of them");
}

/// The number as the driver spells it when it looks for "Node<n>::".
std::optional<std::string> spelledNode(const std::string& text) {
    int node = 0;
    const auto [stop, error] = std::from_chars(text.data(), text.data() + text.size(), node);
    if (stop != text.data() + text.size() || text.starts_with('-')) return std::nullopt;
    if (error != std::errc{} && !text.empty()) return std::nullopt;
    return std::to_string(node);
}

void ignoredNode(const Item& item, Findings& out) {
    if (!item.word.node || !item.word.value) return;
    const std::optional<std::string> spelled = spelledNode(*item.word.node);
    if (!spelled) {
        warn(out, "ignored-node", item.word.place,
             fmt::format("'{}' names no node: '{}' is no decimal number", item.word.name,
                         *item.word.node),
             "write Node1::, Node2:: ...");
    } else if (*spelled != *item.word.node) {
        warn(out, "ignored-node", item.word.place,
             fmt::format("'{}' names node {}, yet its value is never looked at", item.word.name,
                         *spelled),
             fmt::format("write Node{}::{}", *spelled, item.word.key));
    } else if (item.parameter != nullptr && !item.parameter->ofNode) {
        warn(out, "ignored-node", item.word.place,
             fmt::format("'{}' can't differ from node to node; the item is skipped", item.word.key),
             fmt::format("write {}={}", item.word.key, *item.word.value));
    }
}

/// A key that another one's value takes out of use, such as "bits" in RTU mode.
void ignoredKey(const Item& item, Findings& out) {
    if (item.parameter == nullptr || item.parameter->disabledBy.empty() || !item.word.value) return;
    const ParameterInfo* switchKey = item.description.parameter(item.parameter->disabledBy);
    const ScannedItem* given = item.config.item(item.parameter->disabledBy);
    const bool isDefault = given == nullptr && switchKey != nullptr &&
                           switchKey->defaultValue == item.parameter->disablingValue;
    const bool isGiven = given != nullptr && *given->value == item.parameter->disablingValue;
    // Where the switch is left out the driver insists on the key: its usual value is no mistake.
    if (!isGiven && !(isDefault && *item.word.value != item.parameter->preset)) return;
    warn(out, "ignored-key", item.word.place,
         fmt::format("'{}={}' has no effect with {}={}{}", item.word.key, *item.word.value,
                     item.parameter->disabledBy, item.parameter->disablingValue,
                     isDefault ? ", the default" : ""),
         isGiven ? fmt::format("remove it, or change {}", item.parameter->disabledBy)
                 : fmt::format("write {}={}, or another {}", item.word.key, item.parameter->preset,
                               item.parameter->disabledBy));
}

void oddNumber(const Item& item, Findings& out) {
    if (item.parameter == nullptr || !item.parameter->isNumber() || !item.word.value) return;
    const settings::NumberReading number = settings::readNumber(*item.word.value);
    if (number.octal) {
        warn(out, "octal-number", item.word.valuePlace,
             fmt::format("'{}' begins with a zero and is read as octal: {}", *item.word.value,
                         number.value),
             fmt::format("write {}={}", item.word.key,
                         settings::withoutLeadingZeroes(*item.word.value)));
    } else if (number.partial) {
        warn(
            out, "not-a-number", item.word.valuePlace,
            fmt::format("'{}' is no number and is read as {}", *item.word.value, number.value),
            fmt::format("write a whole number, e.g. {}={}", item.word.key, item.parameter->preset));
    }
}

void outOfRange(const Item& item, Findings& out) {
    if (item.parameter == nullptr || !item.parameter->max || !item.word.value) return;
    const long value = settings::readNumber(*item.word.value).value;
    if (value <= *item.parameter->max) return;
    warn(out, "out-of-range", item.word.valuePlace,
         fmt::format("{} is lowered to {}", value, *item.parameter->max),
         fmt::format("write {}={}", item.word.key, *item.parameter->max));
}

bool isListed(const ParameterInfo& parameter, const std::string& value) {
    if (!parameter.isNumber()) {
        return std::find(parameter.choices.begin(), parameter.choices.end(), value) !=
               parameter.choices.end();
    }
    return std::any_of(parameter.choices.begin(), parameter.choices.end(), [&](const auto& choice) {
        return settings::readNumber(choice).value == settings::readNumber(value).value;
    });
}

/// Keys whose words the driver checks itself, or whose words the host may add to.
bool isCheckedElsewhere(const std::string& key) {
    return key == "parity" || key == "mode" || key == "uart";
}

void unlistedValue(const Item& item, Findings& out) {
    if (item.parameter == nullptr || item.parameter->choices.empty() || !item.word.value) return;
    if (isCheckedElsewhere(item.word.key) || isListed(*item.parameter, *item.word.value)) return;
    const std::string nearest = values::nearestName(*item.word.value, item.parameter->choices);
    warn(out, "unlisted-value", item.word.valuePlace,
         fmt::format("'{}' is no value that {} is described with", *item.word.value, item.word.key),
         (nearest.empty() || item.parameter->isNumber()
              ? std::string()
              : fmt::format("did you mean '{}'? ", nearest)) +
             choicesText(*item.parameter));
}

void unknownModel(const Item& item, Findings& out) {
    if (item.parameter == nullptr || item.parameter->type != "prop_modelRef" || !item.word.value) {
        return;
    }
    if (item.description.model(*item.word.value) != nullptr || item.description.models.empty()) {
        return;
    }
    warn(out, "unknown-model", item.word.valuePlace,
         fmt::format("there is no model '{}'; the first one, '{}', is used", *item.word.value,
                     item.description.models.front().name),
         fmt::format("choices: {}", fmt::join(modelsOf(item.description), ", ")));
}

constexpr void (*kRules[])(const Item&, Findings&) = {
    notAnItem, unknownKey, duplicateKey,  ignoredNode,  ignoredKey,
    oddNumber, outOfRange, unlistedValue, unknownModel,
};

void ignoredText(const ScannedConfig& config, Findings& out) {
    if (config.ignoredFront) {
        warn(out, "ignored-text", *config.ignoredFront,
             "the text in front of 'CfgVer=1' is skipped", "begin with CfgVer=1");
    }
    if (config.ignoredRemainder) {
        warn(out, "ignored-text", *config.ignoredRemainder,
             "everything from the second 'CfgVer=' on is skipped", "remove it");
    }
}

/// Each number once, however many keys it is given.
void unusableNodes(const ScannedConfig& config, Findings& out) {
    std::set<std::string> seen;
    for (const ScannedItem& item : config.items) {
        if (!item.node || !item.value || !seen.insert(*item.node).second) continue;
        const auto spelled = spelledNode(*item.node);
        if (spelled != item.node) continue;
        const std::string fault = nodeFault(settings::readNumber(*spelled).value);
        if (!fault.empty()) warn(out, "unusable-node", item.place, fault, kUsableNodes);
    }
}

/// @return what stands between the first pair of single quotes.
std::string quotedIn(const std::string& message) {
    const std::size_t open = message.find('\'');
    if (open == std::string::npos) return {};
    const std::size_t close = message.find('\'', open + 1);
    return close == std::string::npos ? std::string() : message.substr(open + 1, close - open - 1);
}

std::string adviceFor(const ParameterInfo& parameter, bool given) {
    const std::string choices =
        parameter.choices.empty() ? std::string() : "; " + choicesText(parameter);
    if (given) return fmt::format("e.g. {}={}{}", parameter.key, parameter.preset, choices);
    return fmt::format("add e.g. {}={}{}", parameter.key, parameter.preset, choices);
}

const ScannedItem* anyItemOf(const ScannedConfig& config, const std::string& key) {
    if (const ScannedItem* common = config.item(key)) return common;
    for (const ScannedItem& item : config.items) {
        if (item.key == key) return &item;
    }
    return nullptr;
}

}  // namespace

Findings lintConfig(const ScannedConfig& config, const Description& description) {
    Findings out;
    ignoredText(config, out);
    for (const ScannedItem& word : config.items) {
        const Item item{config, description, word, description.parameter(word.key)};
        for (const auto rule : kRules)
            rule(item, out);
    }
    unusableNodes(config, out);
    sortByPlace(out);
    return out;
}

Finding configRefusal(const ScannedConfig& config, const Description& description,
                      const std::string& message) {
    Finding finding{Severity::Error, "refused", config.end, message, {}};
    if (!config.marked) {
        finding.place.line = 1;
        finding.place.column = 1;
        finding.suggestion = "begin with CfgVer=1";
        return finding;
    }
    const std::string key = quotedIn(message);
    const ScannedItem* item = anyItemOf(config, key);
    if (item != nullptr) finding.place = item->valuePlace;
    if (const ParameterInfo* parameter = description.parameter(key)) {
        finding.suggestion = adviceFor(*parameter, item != nullptr);
    }
    return finding;
}

}  // namespace lint
