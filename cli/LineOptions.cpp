// Declares the options of a line and makes the configuration text of them.
#include "cli/LineOptions.h"

#include <fmt/format.h>

#include <CLI/CLI.hpp>

#include "cli/UsageErrors.h"
#include "cli/Validators.h"
#include "cli/override/OverrideWords.h"
#include "settings/ConfigText.h"
#include "settings/FileReader.h"

namespace cli {
namespace {

using settings::ConfigItem;

std::vector<std::string> baudRates() {
    std::vector<std::string> rates;
    for (const SettingWord& word : serialSettings().front().words)
        rates.emplace_back(word.word);
    return rates;
}

constexpr long kLargestNode = 254;
constexpr long kLongestTimeoutMs = 3600000;

void addShortForms(CLI::App& command, LineOptions& options) {
    struct Row {
        const char* name;
        std::string LineOptions::*member;
        CLI::Validator accepts;
        const char* help;
    };
    const Row rows[] = {
        {"--baud", &LineOptions::baud, oneOf(baudRates()), "Same as --set baudrate=N"},
        {"--parity", &LineOptions::parity, oneOf({"none", "even", "odd", "mark"}),
         "Same as --set parity=none|even|odd|mark"},
        {"--stopbits", &LineOptions::stopBits, oneOf({"1", "2"}), "Same as --set stopbits=1|2"},
        {"--node", &LineOptions::node, numberUpTo(kLargestNode), "Same as --set defNodeId=N"},
        {"--model", &LineOptions::model, oneOf({"1", "2", "3", "4"}),
         "Same as --set model=1|2|3|4 (1-based, 0-based, Enron 1-based, Enron 0-based)"},
        {"--timeout", &LineOptions::timeout, numberUpTo(kLongestTimeoutMs),
         "Same as --set timeout=MS"},
    };
    for (const Row& row : rows) {
        command.add_option(row.name, options.*row.member, row.help)
            ->transform(row.accepts)
            ->group("Configuration");
    }
    command.add_flag("--ascii", options.ascii, "Same as --set txMode=ASCII")
        ->group("Configuration");
}

std::vector<ConfigItem> itemsOf(const LineOptions& options) {
    std::vector<ConfigItem> items;
    for (const std::string& setting : options.settings)
        items.push_back(settings::parseConfigItem(setting));
    const auto add = [&items](const std::string& key, const std::string& value) {
        if (!value.empty()) items.push_back(settings::parseConfigItem(key + '=' + value));
    };
    add("baudrate", options.baud);
    add("parity", options.parity);
    add("stopbits", options.stopBits);
    add("defNodeId", options.node);
    add("model", options.model);
    add("timeout", options.timeout);
    if (options.ascii) add("txMode", "ASCII");
    return items;
}

bool namesPort(const std::string& text) {
    return text.starts_with("com") && text.find('=') < text.find('/');
}

}  // namespace

void addLineOptions(CLI::App& command, LineOptions& options, CommandContext& context) {
    command
        .add_option("--port", options.ports,
                    "Device of a port, com1=/dev/ttyUSB0; a device alone serves the "
                    "configuration's port. Can be repeated")
        ->type_name("[NAME=]DEVICE")
        ->allow_extra_args(false)
        ->group("Line");
    command.add_flag("--sim", options.sim, "Talk to a simulated line instead of a port")
        ->excludes("--port")
        ->group("Line");
    command
        .add_flag("--trace", options.trace,
                  "Show every frame on standard error, ASCII ones as characters")
        ->group("Line");
    command.add_flag("--trace-hex", options.traceHex, "--trace with ASCII frames as bytes, too")
        ->group("Line");
    command
        .add_flag("--trace-meaning", options.traceMeaning,
                  "--trace with what each frame means, e.g. 'read 1 holding register at 9'")
        ->group("Line");
    command
        .add_option(
            "--min-gap", options.minGapMs,
            "Shortest silence in ms that ends a reply, for USB adapters that pause, e.g. 20")
        ->type_name("MS")
        ->check(CLI::Range(0, 1000))
        ->group("Line");
    command.add_option("--config", options.configFile, "Configuration text of the driver")
        ->type_name("FILE")
        ->check(notEmpty())
        ->group("Configuration");
    command
        .add_option("--set", options.settings,
                    "Add an item to the configuration or replace one, e.g. timeout=500 or "
                    "Node5::model=2. Can be repeated")
        ->type_name("KEY=VALUE")
        ->allow_extra_args(false)
        ->group("Configuration");
    addShortForms(command, options);
    command
        .add_option("--storage", options.storage,
                    "Where overrides are kept, or 'none'. With --sim the default is 'none'")
        ->type_name("FILE")
        ->check(notEmpty())
        ->group("Driver");
    command.add_option("--ident", options.ident, "Whose overrides: the section of the storage")
        ->type_name("NAME")
        ->check(notEmpty())
        ->group("Driver");
    command.add_option("--protocol", options.protocol, "Protocol of the plug-in")
        ->type_name("NAME")
        ->check(notEmpty())
        ->capture_default_str()
        ->group("Driver");
    addPluginOption(command, context);
}

namespace {

std::string configTextFrom(const LineOptions& options) {
    const std::string base = options.configFile.empty()
                                 ? settings::defaultConfig(options.sim ? "3" : "1")
                                 : settings::readText("configuration", options.configFile,
                                                      {.bytes = settings::kConfigBytes});
    std::vector<ConfigItem> items = itemsOf(options);
    const bool bitsMissing = !settings::itemOf(settings::withItems(base, items), "bits");
    if (options.ascii && bitsMissing) items.push_back({"bits", "8"});
    return settings::withItems(base, items);
}

}  // namespace

std::string configTextOf(const LineOptions& options) {
    return withUsageErrors([&] { return configTextFrom(options); });
}

std::vector<PortMapping> portsOf(const LineOptions& options, const std::string& configText) {
    std::vector<PortMapping> mappings;
    for (const std::string& port : options.ports) {
        if (namesPort(port)) {
            const std::size_t equals = port.find('=');
            mappings.push_back({port.substr(0, equals), port.substr(equals + 1)});
        } else {
            mappings.push_back({settings::itemOf(configText, "uart").value_or("com1"), port});
        }
        if (mappings.back().device.empty()) {
            throw CommandError(ExitCode::Usage, fmt::format("--port {}: no device", port));
        }
    }
    return mappings;
}

}  // namespace cli
