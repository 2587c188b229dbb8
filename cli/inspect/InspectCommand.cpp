// The sub-command `mrtu inspect`.
#include <fmt/format.h>
#include <fmt/ranges.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <ostream>

#include "cli/Commands.h"
#include "cli/describe/OfflineDriver.h"
#include "cli/inspect/Inspection.h"
#include "values/JsonValues.h"
#include "values/TextEscapes.h"

namespace cli {
namespace {

using values::Json;

constexpr const char* kFooter = R"(Examples:
  mrtu inspect build/arm/out/libmrtu.so
  mrtu inspect --json ./libmrtu.so
  mrtu inspect --load ./libmrtu.so

The file is only read. --load also runs its start-up code: not for a file that you do
not trust.
The exit code is 1 when the file is no plug-in, when a symbol is missing, and when
--load can't load a file for this architecture.)";

struct InspectOptions {
    std::string file;
    std::string protocol = "MRTU";
    bool json = false;
    bool load = false;
};

/// What the driver says when it is asked itself.
struct Identity {
    std::string name;
    std::string displayName;
    int type = 0;
    int version = 0;
    std::string implementation;
    std::string description;
};

struct Loading {
    std::optional<Identity> identity;
    std::string refusal;  ///< Why there is no identity.
    bool failed = false;  ///< It should have gone well.
};

std::string textOrNone(const char* text) {
    return text != nullptr ? text : "none";
}

Identity identityOf(const IProtocol& protocol) {
    const auto* const xml = reinterpret_cast<const char*>(protocol.GetXml());
    return {.name = textOrNone(protocol.GetName()),
            .displayName = textOrNone(protocol.GetProtocolName()),
            .type = protocol.GetProtocolType(),
            .version = protocol.GetProtocolVersion(),
            .implementation =
                fmt::format("{} v.{}", textOrNone(protocol.GetImpName()), protocol.GetImpVersion()),
            .description = textOrNone(xml)};
}

Loading load(const Inspection& found, const InspectOptions& options, CommandContext& context) {
    if (!found.runsHere) return {{}, "another architecture; nothing of it was executed", false};
    if (!options.load) return {{}, "only read; --load runs its start-up code and asks it", false};
    if (!found.isComplete()) return {{}, "it is not complete", true};
    try {
        // The loader would look for a name without a folder somewhere else.
        const auto file = std::filesystem::absolute(options.file).string();
        complain(context, fmt::format("loading {}: its start-up code runs now",
                                      values::printableText(options.file)));
        const OfflineDriver driver(file, options.protocol);
        return {identityOf(driver.protocol()), {}, false};
    } catch (const CommandError& error) {
        return {{}, error.what(), true};
    }
}

/// Prints "name           value"; a value may be whatever the file holds.
void printLine(std::ostream& out, const char* name, const std::string& value) {
    out << fmt::format("{:<15}{}\n", name, values::printableText(value));
}

void printFile(std::ostream& out, const Inspection& found) {
    const auto line = [&out](const char* name, const std::string& value) {
        printLine(out, name, value);
    };
    line("file", found.file);
    line("architecture", architectureText(found.architecture));
    const std::string floats = floatAbiText(found.architecture);
    if (!floats.empty()) line("float", floats);
    line("C library", found.glibc.empty() ? "any" : fmt::format("{} or newer", found.glibc));
    line("entry", found.hasEntry ? "present" : "missing");
    for (const NeededLibrary& needed : found.needed)
        line("needs", fmt::format("{} ({})", needed.name, needed.file.value_or("not found here")));
    line("missing",
         found.missing.empty() ? "nothing" : fmt::format("{} symbols", found.missingCount));
    for (const std::string& name : found.missing)
        line("", name);
    if (found.missing.size() < found.missingCount) line("", "...");
    line("header", found.descriptionHeader.empty() ? "none" : found.descriptionHeader);
}

void printLoading(std::ostream& out, const Loading& loading) {
    const auto line = [&out](const char* name, const std::string& value) {
        printLine(out, name, value);
    };
    if (!loading.identity) return line("not loaded", loading.refusal);
    line("name", loading.identity->name);
    line("display name", loading.identity->displayName);
    line("type", std::to_string(loading.identity->type));
    line("version", std::to_string(loading.identity->version));
    line("implementation", loading.identity->implementation);
    line("description", loading.identity->description);
}

Json jsonOf(const Inspection& found, const Loading& loading) {
    Json json;
    json["file"] = found.file;
    json["architecture"] = architectureText(found.architecture);
    const std::string floats = floatAbiText(found.architecture);
    json["float"] = floats.empty() ? Json() : Json(floats);
    json["glibc"] = found.glibc.empty() ? Json() : Json(found.glibc);
    json["entry"] = found.hasEntry;
    json["needed"] = Json::array();
    for (const NeededLibrary& needed : found.needed) {
        json["needed"].push_back(
            {{"name", needed.name}, {"file", needed.file ? Json(*needed.file) : Json()}});
    }
    json["missing"] = found.missing;
    json["missingCount"] = found.missingCount;
    json["header"] = found.descriptionHeader;
    json["identity"] = Json();
    if (loading.identity) {
        json["identity"] = {{"name", loading.identity->name},
                            {"displayName", loading.identity->displayName},
                            {"type", loading.identity->type},
                            {"version", loading.identity->version},
                            {"implementation", loading.identity->implementation},
                            {"description", loading.identity->description}};
    } else {
        json["notLoaded"] = loading.refusal;
    }
    return json;
}

void run(CommandContext& context, const InspectOptions& options) {
    const Inspection found = inspect(options.file);
    const Loading loading = load(found, options, context);
    if (options.json) {
        // What is not UTF-8 is shown as such, and nothing but ASCII reaches a terminal.
        const auto replace = Json::error_handler_t::replace;
        context.out << jsonOf(found, loading).dump(2, ' ', true, replace) << '\n';
    } else {
        printFile(context.out, found);
        printLoading(context.out, loading);
    }
    if (!found.isComplete() || loading.failed) context.exitCode = ExitCode::Other;
}

}  // namespace

CommandSpec inspectCommand(CommandContext& context) {
    const auto options = std::make_shared<InspectOptions>();
    CommandSpec command{.name = "inspect",
                        .summary = "Tell what a plug-in file is and what it needs",
                        .footer = kFooter};
    command.options = {
        {.names = "FILE",
         .target = &options->file,
         .help = "The plug-in, of any architecture",
         .required = true},
        {.names = "--json", .target = &options->json, .help = "Print JSON"},
        {.names = "--load",
         .target = &options->load,
         .help = "Run the file's start-up code and ask it for its names"},
        {.names = "--protocol",
         .target = &options->protocol,
         .help = "Protocol of the plug-in",
         .valueName = "NAME",
         .showsDefault = true},
    };
    command.action = [options, &context] { run(context, *options); };
    return command;
}

}  // namespace cli
