// The sub-command `mrtu info`.
#include <fmt/format.h>

#include <array>
#include <memory>
#include <ostream>

#include "cli/Commands.h"
#include "cli/Validators.h"
#include "runtime/Module.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"

namespace cli {
namespace {

constexpr const char* kFooter = R"(Examples:
  mrtu info
  mrtu info --plugin ./libmrtu.so)";

struct InfoOptions {
    std::string protocol = "MRTU";
};

constexpr std::array kGenerations{"IProtocol7", "IProtocol6", "IProtocol5", "IProtocol4",
                                  "IProtocol3", "IProtocol2", "IProtocol"};

std::string generationOf(IProtocol& protocol) {
    for (const char* const name : kGenerations) {
        if (protocol.ConvertTo(name) != nullptr) return name;
    }
    return "none";
}

std::string infoTextOf(const IProtocol& protocol) {
    std::array<char, 4096> buffer{};
    const int length = protocol.GetInfo(buffer.data(), static_cast<int>(buffer.size()));
    return {buffer.data(), static_cast<std::size_t>(std::max(0, length))};
}

std::string descriptionHeaderOf(const IProtocol& protocol) {
    const unsigned char* const xml = protocol.GetXml();
    return xml == nullptr ? "none" : reinterpret_cast<const char*>(xml);
}

void print(std::ostream& out, const std::string& plugin, IProtocol& protocol) {
    const auto line = [&out](const char* name, const auto& value) {
        out << fmt::format("{:<15}{}\n", name, value);
    };
    line("plug-in", plugin);
    line("name", protocol.GetName());
    line("display name", protocol.GetProtocolName());
    line("type", protocol.GetProtocolType());
    line("version", protocol.GetProtocolVersion());
    line("implementation", fmt::format("{} v.{}", protocol.GetImpName(), protocol.GetImpVersion()));
    line("generation", generationOf(protocol));
    line("description", descriptionHeaderOf(protocol));
    out << '\n' << infoTextOf(protocol);
}

void info(CommandContext& context, const InfoOptions& options) {
    const std::string plugin = pluginFile(context);
    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    runtime::ServiceFactory host(multiTask, serial);
    const auto library = runtime::PluginLibrary::load(plugin);
    if (!library) throw CommandError(ExitCode::Other, library.error().text);
    const auto module = runtime::Module::bind(library.value(), host);
    if (!module) throw CommandError(ExitCode::Other, module.error().text);
    const auto protocol = module.value().createProtocol(options.protocol);
    if (!protocol) throw CommandError(ExitCode::Other, protocol.error().text);
    print(context.out, plugin, *protocol.value());
}

}  // namespace

CommandSpec infoCommand(CommandContext& context) {
    const auto options = std::make_shared<InfoOptions>();
    CommandSpec command{
        .name = "info", .summary = "Tell what the driver says of itself", .footer = kFooter};
    command.options.push_back({.names = "--protocol",
                               .target = &options->protocol,
                               .help = "Protocol of the plug-in",
                               .valueName = "NAME",
                               .check = notEmpty(),
                               .showsDefault = true});
    addPluginOption(command, context);
    command.action = [options, &context] { info(context, *options); };
    return command;
}

}  // namespace cli
