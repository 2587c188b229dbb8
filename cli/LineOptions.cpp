// Declares the options of a line and makes the configuration text of them.
#include "cli/LineOptions.h"

#include <fmt/format.h>

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

void addShortForms(CommandSpec& command, LineOptions& options) {
    command.addGroup(
        "Configuration",
        {
            {.names = "--baud",
             .target = &options.baud,
             .help = "Same as --set baudrate=N",
             .check = oneOf(baudRates())},
            {.names = "--parity",
             .target = &options.parity,
             .help = "Same as --set parity=none|even|odd|mark",
             .choices = {"none", "even", "odd", "mark"}},
            {.names = "--stopbits",
             .target = &options.stopBits,
             .help = "Same as --set stopbits=1|2",
             .choices = {"1", "2"}},
            {.names = "--node",
             .target = &options.node,
             .help = "Same as --set defNodeId=N",
             .check = numberUpTo(kLargestNode)},
            {.names = "--model",
             .target = &options.model,
             .help = "Same as --set model=1|2|3|4 (1-based, 0-based, Enron 1-based, Enron 0-based)",
             .choices = {"1", "2", "3", "4"}},
            {.names = "--timeout",
             .target = &options.timeout,
             .help = "Same as --set timeout=MS",
             .check = numberUpTo(kLongestTimeoutMs)},
            {.names = "--ascii", .target = &options.ascii, .help = "Same as --set txMode=ASCII"},
        });
}

void addPortOptions(CommandSpec& command, LineOptions& options) {
    command.addGroup(
        "Line",
        {
            {.names = "--port",
             .target = &options.ports,
             .help = "Device of a port, com1=/dev/ttyUSB0; a device alone serves the "
                     "configuration's port. Can be repeated",
             .valueName = "[NAME=]DEVICE",
             .oneWordEach = true},
            {.names = "--sim",
             .target = &options.sim,
             .help = "Talk to a simulated line instead of a port",
             .excludes = {"--port"}},
            {.names = "--trace",
             .target = &options.trace,
             .help = "Show every frame on standard error, ASCII ones as characters"},
            {.names = "--trace-hex",
             .target = &options.traceHex,
             .help = "--trace with ASCII frames as bytes, too"},
            {.names = "--trace-meaning",
             .target = &options.traceMeaning,
             .help = "--trace with what each frame means, e.g. 'read 1 holding register at 9'"},
            {.names = "--min-gap",
             .target = &options.minGapMs,
             .help =
                 "Shortest silence in ms that ends a reply, for USB adapters that pause, e.g. 20",
             .valueName = "MS",
             .range = NumberRange{0, 1000}},
            {.names = "--frame-end",
             .target = &options.frameEnd,
             .help = "What ends a reply. With length none is cut by a pause and no silence is "
                     "waited for; not for lines that return what is sent",
             .valueName = "BY",
             .choices = {"silence", "length"},
             .showsDefault = true},
        });
}

void addConfigOptions(CommandSpec& command, LineOptions& options) {
    command.addGroup(
        "Configuration",
        {
            {.names = "--config",
             .target = &options.configFile,
             .help = "Configuration text of the driver",
             .valueName = "FILE",
             .check = notEmpty()},
            {.names = "--set",
             .target = &options.settings,
             .help = "Add an item to the configuration or replace one, e.g. timeout=500 or "
                     "Node5::model=2. Can be repeated",
             .valueName = "KEY=VALUE",
             .oneWordEach = true},
        });
}

void addDriverOptions(CommandSpec& command, LineOptions& options) {
    command.addGroup(
        "Driver",
        {
            {.names = "--storage",
             .target = &options.storage,
             .help = "Where overrides are kept, or 'none'. With --sim the default is 'none'",
             .valueName = "FILE",
             .check = notEmpty()},
            {.names = "--ident",
             .target = &options.ident,
             .help = "Whose overrides: the section of the storage",
             .valueName = "NAME",
             .check = notEmpty()},
            {.names = "--protocol",
             .target = &options.protocol,
             .help = "Protocol of the plug-in",
             .valueName = "NAME",
             .check = notEmpty(),
             .showsDefault = true},
        });
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

void addConfigurationOptions(CommandSpec& command, LineOptions& options) {
    addConfigOptions(command, options);
    addShortForms(command, options);
}

void addLineOptions(CommandSpec& command, LineOptions& options, CommandContext& context) {
    addPortOptions(command, options);
    addConfigurationOptions(command, options);
    addDriverOptions(command, options);
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
