// Where the plug-in is looked for when the command line does not say.
#include <fmt/format.h>

#include <filesystem>
#include <system_error>

#include "cli/Command.h"
#include "cli/CommandSpec.h"
#include "cli/Validators.h"

namespace cli {
namespace {

constexpr const char* kPluginName = "libmrtu.so";

std::filesystem::path executableFolder() {
    std::error_code ignored;
    return std::filesystem::read_symlink("/proc/self/exe", ignored).parent_path();
}

}  // namespace

void addPluginOption(CommandSpec& command, CommandContext& context) {
    command.options.push_back(
        {.names = "--plugin",
         .target = &context.pluginOption,
         .help = "The driver; default is libmrtu.so beside mrtu or in ../lib/mrtu",
         .valueName = "FILE",
         .group = "Driver",
         .check = notEmpty()});
}

std::string pluginFile(const CommandContext& context) {
    if (!context.pluginOption.empty()) return context.pluginOption;
    const std::filesystem::path folder = executableFolder();
    const std::filesystem::path beside = folder / kPluginName;
    const std::filesystem::path installed =
        (folder / "../lib/mrtu" / kPluginName).lexically_normal();
    for (const std::filesystem::path& place : {beside, installed}) {
        std::error_code ignored;
        if (std::filesystem::exists(place, ignored)) return place.string();
    }
    throw CommandError(ExitCode::Other,
                       fmt::format("no plug-in at {} or {}; --plugin FILE names another",
                                   beside.string(), installed.string()));
}

}  // namespace cli
