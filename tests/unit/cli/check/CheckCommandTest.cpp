// The sub-command against the real plug-in.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <utility>
#include <vector>

#include "tests/unit/cli/InProcess.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using values::Json;

namespace fs = std::filesystem;

const std::string kGood =
    "CfgVer=1 defNodeId=1 txMode=RTU uart=com1 baudrate=9600\n"
    "parity=even stopbits=1 mode=RS-485\n";

class CheckCommandTest : public testing::Test {
  protected:
    void SetUp() override {
        std::string name = (fs::temp_directory_path() / "mrtu_check_XXXXXX").string();
        ASSERT_NE(mkdtemp(name.data()), nullptr);
        directory_ = name;
    }
    void TearDown() override { fs::remove_all(directory_); }

    std::string store(const std::string& name, const std::string& text) const {
        const fs::path path = directory_ / name;
        std::ofstream(path, std::ios::binary) << text;
        return path.string();
    }

    Outcome check(const std::string& config, std::vector<std::string> words) const {
        const std::string file = store("line.cfg", config);
        words.insert(words.begin(), {"check", "--config", file, "--plugin", PLUGIN});
        return runInProcess(std::move(words));
    }

    /// The rules of the findings, in order, from --json.
    std::string rules(const std::string& config, std::vector<std::string> words) const {
        words.emplace_back("--json");
        const Outcome outcome = check(config, std::move(words));
        const Json report = Json::parse(outcome.out);
        std::string text;
        for (const Json& finding : report["findings"]) {
            text += finding["rule"].get<std::string>() + ' ';
        }
        return text;
    }

  private:
    fs::path directory_;
};

TEST_F(CheckCommandTest, ATimeoutThatCutsRepliesIsNamedWhereItMatters) {
    const std::string hasty = kGood + "timeout=100\n";
    EXPECT_EQ("", rules(kGood, {}));
    EXPECT_EQ("short-timeout ", rules(hasty, {}));
    EXPECT_EQ("short-timeout ", rules(hasty, {"1?HREG?400001?unsignedShort-125"}));
    EXPECT_EQ("short-timeout ", rules(hasty, {"1?INP?100001?boolean-2000"}));
    EXPECT_EQ("", rules(hasty, {"1?HREG?400001?unsignedShort", "1?OUTP?1?boolean-8"}));
}

TEST_F(CheckCommandTest, CleanConfigurationAndTagsAreClean) {
    const Outcome outcome =
        check(kGood, {"--strict", "1?HREG?400001?unsignedShort", "1?OUTP?1?boolean-8"});
    EXPECT_EQ(0, outcome.code);
    EXPECT_EQ("0 errors, 0 warnings (2 tags checked)\n", outcome.out);
}

TEST_F(CheckCommandTest, ByteOrdersMayBeNamed) {
    const Outcome good =
        check(kGood, {"--strict", "1?HREG?400001?float@ABCD", "1?HREG?400003?double@GHEFCDAB",
                      "1?HREG?400007?string-8@AB"});
    EXPECT_EQ(0, good.code) << good.out;
    const Outcome wrong = check(kGood, {"1?HREG?400001?float@ABDC"});
    EXPECT_EQ(2, wrong.code);
    EXPECT_EQ(
        "argument:1:15: error: 'ABDC' is no byte order of float: ABCD, CDAB, DCBA, BADC "
        "[refused]\n1 error, 0 warnings (1 tag checked)\n",
        wrong.out);
}

TEST_F(CheckCommandTest, WarningsCountOnlyWhenStrict) {
    const std::string config = kGood + "timout=1";
    EXPECT_EQ(0, check(config, {}).code);
    const Outcome strict = check(config, {"--strict"});
    EXPECT_EQ(1, strict.code);
    EXPECT_NE(strict.out.find("line.cfg:3:1: warning: unknown key 'timout' [unknown-key]\n"
                              "    did you mean 'timeout'?\n"),
              std::string::npos)
        << strict.out;
}

TEST_F(CheckCommandTest, RefusedConfigurationIsAnErrorAndLeavesTagsUnchecked) {
    const Outcome outcome = check("CfgVer=1 defNodeId=1", {"1?HREG?x?y"});
    EXPECT_EQ(2, outcome.code);
    EXPECT_NE(outcome.out.find("line.cfg:1:21: error: Parser: parameter 'uart' is not found"),
              std::string::npos)
        << outcome.out;
    EXPECT_NE(outcome.out.find("1 tag not checked"), std::string::npos) << outcome.out;
}

TEST_F(CheckCommandTest, RefusedTagIsAnErrorWithTheDriversWords) {
    const Outcome outcome = check(kGood, {"1?INP?100001?unsignedShort"});
    EXPECT_EQ(2, outcome.code);
    EXPECT_NE(outcome.out.find("argument:1:14: error: "), std::string::npos) << outcome.out;
    EXPECT_NE(outcome.out.find("not allowed icom type"), std::string::npos) << outcome.out;
}

TEST_F(CheckCommandTest, EveryListedSilenceIsFound) {
    EXPECT_EQ("ignored-key duplicate-key unknown-model unknown-key ",
              rules(kGood + "bits=8 repeat=1 repeat=2 model=x timout=5", {}));
    struct Case {
        std::vector<std::string> uris;
        const char* rules;
    };
    const Case cases[] = {
        {{"9?HREG?400001?short"}, "unnamed-node "},
        {{"1?OUTP?0100?boolean"}, "octal-number "},
        {{"1?HREG?40001?short"}, "short-address "},
        {{"1?HREG?400001?float", "1?HREG?400002?short"}, "overlap "},
        {{"1?HREG?400001?short", "1?HREG?400001.3?boolean"}, "shared-register "},
        // The five-digit form is the same register: both tags are short of being clear.
        {{"1?HREG?40001?float", "1?HREG?400002?short"}, "short-address overlap "},
        {{"1?OUTP?1?boolean-16", "1?OUTP?3?boolean"}, ""},
    };
    for (const Case& each : cases) {
        EXPECT_EQ(each.rules, rules(kGood, each.uris)) << each.uris.front();
    }
}

TEST_F(CheckCommandTest, WhatCanNeverWorkIsFound) {
    struct Case {
        const char* uri;
        const char* rules;
    };
    const Case cases[] = {
        {"1?HREG?400001?string-0", "empty-tag "},
        {"1?HREG?400001?int-", "empty-tag "},
        {"1?OUTP?1?boolean-0", "empty-tag "},
        {"1?HREG?465536?int", "outside-area "},
        {"1?HREG?400001?int-1000000000", "outside-area "},
        {"1?IREG?365535?short-3", "outside-area "},
        {"1?OUTP?65536?boolean-2", "outside-area "},
        {"1?HREG?400001.2000000000?boolean", "outside-area "},
        {"1?HREG?400001?byte-3(swap2)", "impossible-conversion "},
        {"1?HREG?400001?short(swap4)", "impossible-conversion "},
        {"1?HREG?400001?int(swap8)", "impossible-conversion "},
        {"1?HREG?400001?unsignedShort(neg)", "impossible-conversion "},
        {"1?HREG?400001?short(inv)", "impossible-conversion "},
        {"1?HREG?400001?uint64(bcd)", "impossible-conversion "},
        {"1?HREG?400001?short-10(neg)", "partial-conversion "},
        {"1?HREG?400001?int64-2(neg)", "partial-conversion "},
        {"1?HREG?400001?byte-10(neg)", ""},
        {"1?HREG?400001?short(neg)", ""},
        {"1?HREG?400001?int-4(bcd,swap2,swap4)", ""},
        {"1?OUTP?1?boolean-3(inv)", ""},
        {"1?OUTP?5.3?boolean", "ignored-subindex "},
        {"1?OUTP?5.-3?boolean", "negative-subindex "},
        {"0?HREG?400001?short", "unnamed-node unusable-node "},
        {"255?HREG?400001?short", "unnamed-node unusable-node "},
        {"257?HREG?400001?short", "unnamed-node unusable-node "},
        {"1?NO?0?unsignedByte", ""},
        {"1?SP_Baud?0?unsignedInt", ""},
    };
    for (const Case& each : cases)
        EXPECT_EQ(each.rules, rules(kGood + "model=1", {each.uri})) << each.uri;
    EXPECT_EQ("repeated-coils ", rules(kGood + "forceFunction=05", {"1?OUTP?1?boolean-16"}));
    EXPECT_EQ("", rules(kGood + "forceFunction=05", {"1?OUTP?1?boolean-8"}));
}

TEST_F(CheckCommandTest, WhatFailsWithEveryAccessIsAnError) {
    EXPECT_EQ(2, check(kGood, {"1?HREG?465536?int"}).code);
    EXPECT_EQ(2, check(kGood, {"1?HREG?400001?short(swp2)"}).code);
    EXPECT_EQ(0, check(kGood, {"1?HREG?400001?short-10(neg)"}).code);
}

TEST_F(CheckCommandTest, ControlCharactersOfTheFilesStayOffTheTerminal) {
    const Outcome outcome = check(kGood + "\x1b[2J=1", {"1?HREG\x1b?400001?short"});
    EXPECT_EQ(std::string::npos, outcome.out.find('\x1b')) << outcome.out;
    EXPECT_NE(std::string::npos, outcome.out.find("unknown key '\\x1b[2J'")) << outcome.out;
}

TEST_F(CheckCommandTest, ZeroBasedModelsShareTheirFiveDigitForms) {
    EXPECT_EQ("short-address overlap ",
              rules(kGood + "model=2", {"1?HREG?40010?short", "1?HREG?400010?float"}));
}

TEST_F(CheckCommandTest, WideRegistersOfTheEnronModelsAreTakenByTheirWidth) {
    EXPECT_EQ("", rules(kGood + "model=3", {"1?LONG?0?int", "1?LONG?1?float"}));
    EXPECT_EQ("overlap ", rules(kGood + "model=3", {"1?LONG?0?int-2", "1?LONG?1?float"}));
}

TEST_F(CheckCommandTest, TagsMayComeFromAFile) {
    const std::string tags =
        store("tags", "# two\n1?HREG?400001?short\n\n1?HREG?400001?float # b\n");
    const Outcome outcome = check(kGood, {"--tags", tags});
    EXPECT_EQ(0, outcome.code);
    EXPECT_NE(outcome.out.find("tags:4:8: warning: overlaps '1?HREG?400001?short'"),
              std::string::npos)
        << outcome.out;
}

std::string contentsOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// The text as Markdown shows it verbatim, without the folder that the test runs in.
std::string asShown(std::string text, const std::string& folder) {
    for (auto at = text.find(folder); at != std::string::npos; at = text.find(folder)) {
        text.erase(at, folder.size());
    }
    std::istringstream lines(text);
    std::string shown;
    for (std::string line; std::getline(lines, line);)
        shown.append("    ").append(line) += '\n';
    return shown;
}

TEST_F(CheckCommandTest, DocumentationShowsTheRealOutput) {
    const std::string folder = SOURCE_FOLDER "/examples/check/";
    const std::pair<const char*, const char*> examples[] = {{"line.cfg", "tags.txt"},
                                                            {"plant.cfg", "plant.csv"}};
    for (const auto& [config, list] : examples) {
        const std::string copy = store(list, contentsOf(folder + list));
        const Outcome outcome = check(contentsOf(folder + config), {"--tags", copy});
        const std::string shown = asShown(outcome.out, fs::path(copy).parent_path().string() + "/");
        EXPECT_NE(contentsOf(SOURCE_FOLDER "/docs/check.md").find(shown), std::string::npos)
            << shown;
    }
}

TEST_F(CheckCommandTest, JsonCountsWhatItLists) {
    const Outcome outcome = check(kGood + "timout=1", {"--json", "1?HREG?1?short"});
    EXPECT_EQ(2, outcome.code);
    const Json json = Json::parse(outcome.out);
    EXPECT_EQ(1, json["errors"]);
    EXPECT_EQ(1, json["warnings"]);
    EXPECT_EQ(1, json["tagsChecked"]);
    EXPECT_EQ(2U, json["findings"].size());
}

TEST_F(CheckCommandTest, JsonSurvivesBytesThatAreNoText) {
    const Outcome outcome = check(kGood + "\xff\xfe=1", {"--json"});
    EXPECT_EQ(0, outcome.code);
    EXPECT_EQ(1, Json::parse(outcome.out)["warnings"]);
}

TEST_F(CheckCommandTest, UnreadableFilesAreWrongUsage) {
    EXPECT_EQ(2, check(kGood, {"--tags", "/nowhere/tags"}).code);
    EXPECT_EQ(2, check(kGood, {"--tags", "/"}).code);
}

TEST_F(CheckCommandTest, WhatReadRefusesIsRefused) {
    const struct {
        std::string config;
        const char* reason;
    } cases[] = {
        {kGood + std::string("\0timeout=1", 10), ": holds a zero byte\n"},
        {kGood + std::string(1024 * 1024, ' '), ": longer than 1 MiB\n"},
    };
    for (const auto& each : cases) {
        const Outcome outcome = check(each.config, {});
        EXPECT_EQ(2, outcome.code);
        EXPECT_TRUE(outcome.err.ends_with(each.reason)) << outcome.err;
    }
    const Outcome endless = runInProcess({"check", "--config", "/dev/zero", "--plugin", PLUGIN});
    EXPECT_EQ(2, endless.code);
    EXPECT_EQ("mrtu: configuration /dev/zero: longer than 1 MiB\n", endless.err);
}

TEST_F(CheckCommandTest, TagsFileIsReadWithTheSameCare) {
    EXPECT_EQ(2, check(kGood, {"--tags", "/dev/zero"}).code);
    EXPECT_EQ(2, check(kGood, {"--tags", store("tags", std::string("1?\0", 3))}).code);
}

TEST_F(CheckCommandTest, NamesChooseTagsOfTheList) {
    const std::string tags = store("tags.csv",
                                   "name,uri\nflow,1?HREG?400001?short\nodd,1?HREG?400001?float\n"
                                   "far,9?HREG?400005?short\n");
    EXPECT_EQ("overlap unnamed-node ", rules(kGood, {"--tags", tags}));
    EXPECT_EQ("", rules(kGood, {"--tags", tags, "flow"}));
    EXPECT_EQ("", rules(kGood, {"--tags", tags, "odd", "1?HREG?400005?short"}));
    EXPECT_EQ("unnamed-node overlap ",
              rules(kGood, {"--tags", tags, "flow", "far", "1?HREG?400001?float"}));
    const Outcome outcome = check(kGood, {"--tags", tags, "flwo"});
    EXPECT_EQ("mrtu: no tag 'flwo' in " + tags + "; 'flow' perhaps\nmrtu: nothing was done\n",
              outcome.err);
    EXPECT_EQ(2, outcome.code);
}

TEST_F(CheckCommandTest, WhatOnlyAListShowsIsFound) {
    const std::string tags = store("tags.csv",
                                   "name,uri,period,scale,offset,decimals,low,high\n"
                                   "flow,1?HREG?400001?short,500,0.1,,,0,100\n"
                                   "slow,1?HREG?400001?short,2s,,,,,\n"
                                   "lamp,1?OUTP?1?boolean,,10,,,,\n"
                                   "bits,1?OUTP?9?boolean-8,,,1,,,\n"
                                   "text,1?HREG?400020?string-8,,,,2,,\n"
                                   "back,1?HREG?400030?float,,,,,10,-10\n");
    const Outcome outcome = check(kGood, {"--tags", tags});
    const auto has = [&](const char* text) {
        EXPECT_NE(std::string::npos, outcome.out.find(text)) << text << " in\n" << outcome.out;
    };
    has("tags.csv:3:26: warning: 'slow' is wanted every 2000 ms, and 'flow' (");
    has("tags.csv:2) on the same items every 500 ms [two-periods]\n");
    has("tags.csv:4:24: warning: 'lamp' holds no number: the scale has no effect [unused-scale]\n");
    has("tags.csv:5:27: warning: 'bits' holds no number: the offset has no effect");
    has("tags.csv:6:32: warning: 'text' holds no number: the number of decimals has no effect");
    has("tags.csv:7:30: warning: the low limit of 'back', 10, is above its high limit, -10: "
        "nothing can be written [swapped-limits]\n");
    EXPECT_EQ(0, outcome.code);
}

TEST_F(CheckCommandTest, MistakesOfAListAreErrorsAndDoNotHideTheOthers) {
    const std::string tags = store("tags.csv",
                                   "name,uri,period\nflow,1?HREG?400001?short,0\n"
                                   "flow,1?HREG?400001?float,1\n,1?HREG?400009?short,1\n");
    EXPECT_EQ("bad-period duplicate-name overlap empty-name ", rules(kGood, {"--tags", tags}));
    const Outcome outcome = check(kGood, {"--tags", tags, "any"});
    EXPECT_NE(std::string::npos,
              outcome.out.find("tags.csv:3:1: error: a second tag 'flow', see line 2: expected a "
                               "name of its own [duplicate-name]\n"))
        << outcome.out;
    EXPECT_EQ(2, outcome.code);
    EXPECT_EQ("empty-list ", rules(kGood, {"--tags", store("empty", "# none\n")}));
}

TEST_F(CheckCommandTest, TheExampleListIsGood) {
    EXPECT_EQ(
        "", rules(kGood + "Node2::prefix=pump\n", {"--tags", SOURCE_FOLDER "/examples/tags.csv"}));
}

}  // namespace
}  // namespace cli
