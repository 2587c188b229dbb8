#include "SampleProgram.h"

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

namespace manual_test {

cli::manual::Command sampleProgram() {
    std::string text;
    std::vector<std::string> texts;
    bool flag = false;
    CLI::App app("Does things. And more.", "tool");
    app.footer("Exit codes:\n  0  done\n  2  wrong");

    CLI::App* const fetch = app.add_subcommand("fetch", "Fetch it's [all]");
    fetch->add_flag("-q,--quiet", flag, "Say nothing");
    fetch->add_option("--colour", text, "Which one")->check(CLI::IsMember({"red", "blue"}));
    fetch->add_option("--parity", text, "Same as --set parity=none|even|odd")->group("Line");
    fetch->add_option("--file", text, "Where: a path")->type_name("FILE")->group("Line");
    fetch->add_option("--hidden", text, "Nobody's business")->group("");
    fetch->add_option("URI", texts, "What to fetch")->required();
    fetch->footer("Reads on.\n\nExamples:\n  tool fetch '1?A.-2' \\\n  .dotted");

    CLI::App* const store = app.add_subcommand("store", "Look at what is kept");
    store->add_subcommand("set", "Keep")->add_option("--file", text, "Where")->type_name("FILE");
    store->add_subcommand("list", "List");
    app.add_subcommand("secret", "Hidden")->group("");
    return cli::manual::describe(app);
}

const cli::manual::Command& commandOf(const cli::manual::Command& program,
                                      const std::string& path) {
    for (const cli::manual::Command* each : withSubcommands(program))
        if (each->path() == path) return *each;
    throw std::logic_error("no such command: " + path);
}

}  // namespace manual_test
