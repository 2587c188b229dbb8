#include "SampleProgram.h"

#include <string>
#include <vector>

namespace manual_test {
namespace {

cli::CommandSpec fetchCommand(bool& flag, std::string& text, std::vector<std::string>& texts) {
    return {
        .name = "fetch",
        .summary = "Fetch it's [all]",
        .footer = "Reads on.\n\nExamples:\n  tool fetch '1?A.-2' \\\n  .dotted",
        .options = {
            {.names = "-q,--quiet", .target = &flag, .help = "Say nothing"},
            {.names = "--colour", .target = &text, .help = "Which one", .choices = {"red", "blue"}},
            {.names = "--parity",
             .target = &text,
             .help = "Same as --set parity=none|even|odd",
             .group = "Line",
             .choices = {"none", "even", "odd"}},
            {.names = "--file",
             .target = &text,
             .help = "Where: a path",
             .valueName = "FILE",
             .group = "Line"},
            {.names = "URI", .target = &texts, .help = "What to fetch", .required = true}}};
}

cli::CommandSpec storeCommand(std::string& text) {
    return {.name = "store",
            .summary = "Look at what is kept",
            .commands = {
                {.name = "set",
                 .summary = "Keep",
                 .options =
                     {{.names = "--file", .target = &text, .help = "Where", .valueName = "FILE"}}},
                {.name = "list", .summary = "List"}}};
}

}  // namespace

cli::manual::Command sampleProgram() {
    std::string text;
    std::vector<std::string> texts;
    bool flag = false;
    return cli::manual::describe(
        {.name = "tool",
         .summary = "Does things. And more.",
         .footer = "Exit codes:\n  0  done\n  2  wrong",
         .commands = {fetchCommand(flag, text, texts), storeCommand(text)}});
}

const cli::manual::Command& commandOf(const cli::manual::Command& program,
                                      const std::string& path) {
    for (const cli::manual::Command* each : withSubcommands(program))
        if (each->path() == path) return *each;
    throw std::logic_error("no such command: " + path);
}

}  // namespace manual_test
