#include "cli/LineOptions.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <sstream>

#include "cli/CommandParser.h"
#include "settings/ConfigText.h"

namespace {

/// What the words of a command line set, and what became of the line.
struct Parsed {
    cli::LineOptions options;
    bool accepted;
};

Parsed parse(std::vector<std::string> words) {
    Parsed parsed;
    std::ostringstream sink;
    cli::CommandContext context{
        .out = sink, .err = sink, .exitCode = cli::ExitCode::Done, .pluginOption = {}};
    std::vector<std::string> uris;
    cli::CommandSpec command{.name = "command", .summary = ""};
    cli::addLineOptions(command, parsed.options, context);
    command.options.push_back({.names = "URI", .target = &uris, .help = ""});
    const cli::ParsedLine line = cli::parseCommandLine(command, std::move(words));
    parsed.accepted = std::holds_alternative<cli::Accepted>(line);
    return parsed;
}

cli::LineOptions parsed(std::vector<std::string> words) {
    const Parsed line = parse(std::move(words));
    EXPECT_TRUE(line.accepted);
    return line.options;
}

std::string configOf(std::vector<std::string> words) {
    return cli::configTextOf(parsed(std::move(words)));
}

/// A file of its own for each test, gone afterwards.
class ConfigFile {
  public:
    explicit ConfigFile(const std::string& text)
        : path_(testing::TempDir() + "line_options_" +
                testing::UnitTest::GetInstance()->current_test_info()->name()) {
        std::ofstream(path_, std::ios::binary) << text;
    }
    ~ConfigFile() { std::remove(path_.c_str()); }
    ConfigFile(const ConfigFile&) = delete;
    ConfigFile& operator=(const ConfigFile&) = delete;
    const std::string& path() const { return path_; }

  private:
    std::string path_;
};

TEST(LineOptionsTest, WithoutAFileTheDefaultConfigurationServes) {
    EXPECT_EQ(configOf({}), settings::defaultConfig("1"));
    EXPECT_EQ(configOf({"--sim"}), settings::defaultConfig("3"));
}

TEST(LineOptionsTest, ShortFormsSetTheirItems) {
    const std::string text =
        configOf({"--baud", "9600", "--parity", "even", "--stopbits", "2", "--node", "5", "--model",
                  "2", "--timeout", "100", "--ascii", "--set", "repeat=0"});
    EXPECT_EQ("9600", settings::itemOf(text, "baudrate"));
    EXPECT_EQ("even", settings::itemOf(text, "parity"));
    EXPECT_EQ("2", settings::itemOf(text, "stopbits"));
    EXPECT_EQ("5", settings::itemOf(text, "defNodeId"));
    EXPECT_EQ("2", settings::itemOf(text, "model"));
    EXPECT_EQ("100", settings::itemOf(text, "timeout"));
    EXPECT_EQ("ASCII", settings::itemOf(text, "txMode"));
    EXPECT_EQ("0", settings::itemOf(text, "repeat"));
}

TEST(LineOptionsTest, OptionsWinOverTheFile) {
    const ConfigFile file("CfgVer=1\ntimeout=1\nbits=7\nuart=com3\n");
    const std::string text = configOf({"--config", file.path(), "--set", "timeout=2", "--ascii"});
    EXPECT_EQ("2", settings::itemOf(text, "timeout"));
    EXPECT_EQ("7", settings::itemOf(text, "bits"));
    EXPECT_EQ("com3", settings::itemOf(text, "uart"));
}

TEST(LineOptionsTest, AsciiNeedsDataBitsAndGetsThem) {
    const ConfigFile file("CfgVer=1 uart=com1");
    EXPECT_EQ("8", settings::itemOf(configOf({"--config", file.path(), "--ascii"}), "bits"));
    EXPECT_EQ(std::nullopt, settings::itemOf(configOf({"--config", file.path()}), "bits"));
}

TEST(LineOptionsTest, AFileThatCannotBeTakenIsAUsageError) {
    const ConfigFile zero(std::string("CfgVer=1 \0 x=1", 14));
    const ConfigFile* const files[] = {&zero};
    for (const std::string& path : {files[0]->path(), std::string("/nowhere/at/all"),
                                    testing::TempDir(), std::string("/dev/zero")}) {
        try {
            configOf({"--config", path});
            ADD_FAILURE() << path << " was taken";
        } catch (const cli::CommandError& error) {
            EXPECT_EQ(cli::ExitCode::Usage, error.code()) << path;
            EXPECT_NE(std::string(error.what()).find(path), std::string::npos) << error.what();
        }
    }
}

TEST(LineOptionsTest, APortTakesOneWordAndCanBeRepeated) {
    const cli::LineOptions options =
        parsed({"--port", "com1=/dev/a", "--port", "com2=/dev/b", "1?HREG?400001?int"});
    const auto ports = cli::portsOf(options, "CfgVer=1 uart=com1");
    ASSERT_EQ(2U, ports.size());
    EXPECT_EQ("com1", ports[0].name);
    EXPECT_EQ("/dev/a", ports[0].device);
    EXPECT_EQ("com2", ports[1].name);
    EXPECT_EQ("/dev/b", ports[1].device);
}

TEST(LineOptionsTest, ADeviceAloneServesTheConfiguredPort) {
    const auto ports =
        cli::portsOf(parsed({"--port", "/dev/serial/by-id/com=1"}), "CfgVer=1 uart=com5");
    ASSERT_EQ(1U, ports.size());
    EXPECT_EQ("com5", ports[0].name);
    EXPECT_EQ("/dev/serial/by-id/com=1", ports[0].device);
}

TEST(LineOptionsTest, APortWithoutDeviceIsRefused) {
    EXPECT_THROW(cli::portsOf(parsed({"--port", "com1="}), "CfgVer=1"), cli::CommandError);
}

TEST(LineOptionsTest, SimulatorAndPortExcludeEachOther) {
    EXPECT_FALSE(parse({"--sim", "--port", "/dev/a"}).accepted);
    EXPECT_TRUE(parse({"--port", "/dev/a"}).accepted);
}

}  // namespace
