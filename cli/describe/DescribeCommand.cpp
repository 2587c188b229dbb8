// The sub-command `mrtu describe`.
#include <array>
#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/Validators.h"
#include "cli/describe/DescriptionJson.h"
#include "cli/describe/DescriptionTables.h"
#include "cli/describe/OfflineDriver.h"

namespace cli {
namespace {

using settings::Description;

constexpr const char* kFooter = R"(Examples:
  mrtu describe
  mrtu describe parameters
  mrtu describe --json models
  mrtu describe --xml > mrtu.xml)";

struct Options {
    std::string section;
    std::string protocol = "MRTU";
    bool xml = false;
    bool json = false;
};

struct Section {
    const char* name;  ///< Empty: everything.
    std::string (*text)(const Description&);
    values::Json (*json)(const Description&);
};

constexpr std::array kSections{
    Section{"", descriptionText, descriptionJson},
    Section{"models", modelsText, modelsJson},
    Section{"memory", memoryText, memoryJson},
    Section{"parameters", parametersText, parametersJson},
    Section{"conversions", conversionsText, conversionsJson},
};

void describe(const Options& options, const CommandContext& context) {
    const OfflineDriver driver(pluginFile(context), options.protocol);
    const std::string document = driver.description();
    if (options.xml) {
        context.out << document;
        return;
    }
    const Description description = settings::parseDescription(document);
    for (const Section& section : kSections) {
        if (section.name != options.section) continue;
        if (options.json) {
            context.out << section.json(description).dump(2) << '\n';
        } else {
            context.out << section.text(description);
        }
    }
}

}  // namespace

CommandSpec describeCommand(CommandContext& context) {
    const auto options = std::make_shared<Options>();
    CommandSpec command{.name = "describe",
                        .summary = "Show what a configuration may say and what the models offer",
                        .footer = kFooter};
    command.options = {
        {.names = "section",
         .target = &options->section,
         .help = "Only this part of the description",
         .check = oneOf({"models", "memory", "parameters", "conversions"})},
        {.names = "--json", .target = &options->json, .help = "Print JSON"},
        {.names = "--xml",
         .target = &options->xml,
         .help = "Print the document itself, byte for byte",
         .excludes = {"--json", "section"}},
        {.names = "--protocol",
         .target = &options->protocol,
         .help = "The protocol's name in the plug-in",
         .valueName = "NAME",
         .group = "Driver",
         .check = notEmpty(),
         .showsDefault = true},
    };
    addPluginOption(command, context);
    command.action = [options, &context] { describe(*options, context); };
    return command;
}

}  // namespace cli
