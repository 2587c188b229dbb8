// Writes the man pages and the completions of the command; a step of the build, not installed.
//
//     mrtu_manual FOLDER     man1/*.1, completions/mrtu.bash, _mrtu, mrtu.fish
#include <filesystem>
#include <fstream>
#include <iostream>

#include "cli/Command.h"
#include "cli/manual/Manual.h"

namespace {

void write(const std::filesystem::path& file, const std::string& text) {
    std::filesystem::create_directories(file.parent_path());
    std::ofstream stream(file, std::ios::binary);
    stream << text;
    stream.close();
    if (!stream) throw std::runtime_error(file.string() + ": can't be written");
}

void writeAll(const std::filesystem::path& folder) {
    cli::CommandContext context{
        .out = std::cout, .err = std::cerr, .exitCode = cli::ExitCode::Done, .pluginOption = {}};
    const cli::manual::Command program = cli::manual::describe(cli::commandLine(context));

    const auto writePage = [&](const cli::manual::Command& command) {
        write(folder / "man1" / (command.joined("-") + ".1"),
              cli::manual::manPage(command, program, MRTU_VERSION));
    };
    writePage(program);
    for (const cli::manual::Command& command : program.commands)
        writePage(command);

    const std::filesystem::path completions = folder / "completions";
    write(completions / "mrtu.bash", cli::manual::bashCompletion(program));
    write(completions / "_mrtu", cli::manual::zshCompletion(program));
    write(completions / "mrtu.fish", cli::manual::fishCompletion(program));
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::cerr << "usage: mrtu_manual FOLDER\n";
        return 2;
    }
    try {
        writeAll(argv[1]);
    } catch (const std::exception& error) {
        std::cerr << error.what() << '\n';
        return 1;
    }
}
