// The sub-command `mrtu describe`.
#include <CLI/CLI.hpp>
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

void addDescribeCommand(CLI::App& app, CommandContext& context) {
    auto options = std::make_shared<Options>();
    CLI::App* command = app.add_subcommand(
        "describe", "Show what a configuration may say and what the models offer");
    CLI::Option* section =
        command->add_option("section", options->section, "Only this part of the description")
            ->transform(oneOf({"models", "memory", "parameters", "conversions"}));
    CLI::Option* json = command->add_flag("--json", options->json, "Print JSON");
    command->add_flag("--xml", options->xml, "Print the document itself, byte for byte")
        ->excludes(json)
        ->excludes(section);
    command->add_option("--protocol", options->protocol, "The protocol's name in the plug-in")
        ->type_name("NAME")
        ->check(notEmpty())
        ->capture_default_str()
        ->group("Driver");
    addPluginOption(*command, context);
    command->footer(kFooter);
    command->callback([options, &context] { describe(*options, context); });
}

}  // namespace cli
