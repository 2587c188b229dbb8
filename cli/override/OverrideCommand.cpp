// The sub-command `mrtu override`.
#include <fmt/format.h>

#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/override/Overrides.h"

namespace cli {
namespace {

constexpr const char* kFooter =
    R"(An override takes the place of what the configuration says, and stays until it is cleared:
  node N=M              talk to slave address M where the configuration says node N; "off" disables
  modicon N=on|off      count the registers of node N from 1 (on) or from 0 (off)
  baud=, parity=, stop=, mode=   settings of the line
Overrides belong to an ident, which all lines share that are not given one of their own by --ident.

Examples:
  mrtu override list --port /dev/ttyUSB0
  mrtu override set --port /dev/ttyUSB0 node 5=7 6=off modicon 5=on
  mrtu override set --port /dev/ttyUSB0 baud=38400 parity=even stop=2 mode=RS-485
  mrtu override clear node 5 6 baud parity
  mrtu override clear all)";

struct OverrideOptions {
    LineOptions line;
    std::vector<std::string> words;
};

class Printer {
  public:
    Printer(std::ostream& out, Overrides& overrides) : out_(out), overrides_(overrides) {}

    void node(int node) {
        const std::uint32_t address = overrides_.address(node);
        line(fmt::format("node {}", node), addressWord(address),
             overrides_.storesAddress(node, address));
    }
    void modicon(int node) {
        const bool on = overrides_.modicon(node);
        line(fmt::format("modicon {}", node), on ? "on" : "off",
             overrides_.storesModicon(node, on));
    }
    void serial(const SerialSetting& setting) {
        const std::uint32_t code = overrides_.serial(setting);
        line(std::string(setting.name), wordOf(setting, code), overrides_.stores(setting, code));
    }

  private:
    void line(const std::string& what, const std::string& value, bool stored) {
        out_ << fmt::format("{} = {}{}\n", what, value, stored ? " (stored)" : "");
    }

    std::ostream& out_;
    Overrides& overrides_;
};

void list(CommandContext& context, const OverrideOptions& options) {
    Session session(context, options.line);
    session.start();
    Overrides overrides(session);
    Printer printer(context.out, overrides);
    for (const int node : overrides.nodes()) {
        printer.node(node);
        printer.modicon(node);
    }
    for (const SerialSetting& setting : serialSettings())
        printer.serial(setting);
    session.checkStorage();
}

void set(CommandContext& context, const OverrideOptions& options) {
    const OverrideChanges changes = parseChanges(options.words);
    Session session(context, options.line, StorageNeed::Keep);
    session.start();
    Overrides overrides(session);
    Printer printer(context.out, overrides);
    for (const NodeChange& change : changes.nodes) {
        overrides.setAddress(change.node, change.address);
        printer.node(change.node);
    }
    for (const ModiconChange& change : changes.modicon) {
        overrides.setModicon(change.node, change.on);
        printer.modicon(change.node);
    }
    overrides.setSerial(changes.serial);
    for (const SerialChange& change : changes.serial)
        printer.serial(*change.setting);
    session.checkStorage();
    if (session.storage() == nullptr) {
        complain(context, "there is no storage: the overrides end with this command");
    }
}

/// No line is opened: settings with which no port opens are to be cleared too.
void clear(CommandContext& context, const OverrideOptions& options) {
    const OverrideRemovals removals = parseRemovals(options.words);
    Session session(context, options.line, StorageNeed::Keep);
    if (session.storage() == nullptr) {
        throw CommandError(ExitCode::Usage, "there is no storage to clear anything in");
    }
    Overrides overrides(session);
    if (removals.all) overrides.forgetAll();
    for (const int node : removals.nodes)
        overrides.forgetAddress(node);
    for (const int node : removals.modicon)
        overrides.forgetModicon(node);
    for (const SerialSetting* setting : removals.serial)
        overrides.forget(*setting);
    session.checkStorage();
    context.out << "cleared\n";
}

using Action = void (*)(CommandContext&, const OverrideOptions&);

CommandSpec actionCommand(CommandContext& context, const char* name, const char* summary,
                          Action action, const char* words) {
    const auto options = std::make_shared<OverrideOptions>();
    CommandSpec command{.name = name, .summary = summary};
    addLineOptions(command, options->line, context);
    if (words != nullptr)
        command.options.push_back(
            {.names = words, .target = &options->words, .help = "See below", .required = true});
    command.action = [options, &context, action] { action(context, *options); };
    return command;
}

}  // namespace

CommandSpec overrideCommand(CommandContext& context) {
    return {.name = "override",
            .summary = "Look at and change what replaces the configuration",
            .footer = kFooter,
            .commands = {actionCommand(context, "list", "Print the values in force", list, nullptr),
                         actionCommand(context, "set", "Replace values", set, "WORDS"),
                         actionCommand(context, "clear", "Go back to the configuration", clear,
                                       "WORDS")},
            .needsCommand = true};
}

}  // namespace cli
