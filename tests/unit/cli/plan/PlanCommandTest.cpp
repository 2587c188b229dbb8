// The sub-command against the real plug-in.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <sstream>

#include "tests/unit/cli/InProcess.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using values::Json;

namespace fs = std::filesystem;

const std::string kLine =
    "CfgVer=1 defNodeId=1 txMode=RTU uart=com1 baudrate=19200\n"
    "parity=none bits=8 stopbits=1 mode=RS-232 Node2::delay=5 Node3::maxOptLen=8\n";

const std::string kTags =
    "name,uri,period\n"
    "pressure,1?HREG?400010?float,200\n"
    "level,1?HREG?400012?short,\n"
    "alarm,1?HREG?400014.3?boolean,200\n"
    "recipe,1?HREG?400100?short-200,10000\n"
    "pump,1?OUTP?1?boolean,200\n"
    "counter,2?IREG?300001?unsignedInt@CDAB,\n";

class PlanCommandTest : public testing::Test {
  protected:
    void SetUp() override {
        std::string name = (fs::temp_directory_path() / "mrtu_plan_XXXXXX").string();
        ASSERT_NE(mkdtemp(name.data()), nullptr);
        directory_ = name;
    }
    void TearDown() override { fs::remove_all(directory_); }

    std::string store(const std::string& name, const std::string& text) const {
        const fs::path path = directory_ / name;
        std::ofstream(path, std::ios::binary) << text;
        return path.string();
    }
    Outcome plan(std::vector<std::string> words) const {
        const std::string file = store("line.cfg", kLine);
        words.insert(words.begin(), {"plan", "--config", file, "--plugin", PLUGIN});
        return runInProcess(std::move(words));
    }
    Outcome planList(const std::string& tags, std::vector<std::string> words = {}) const {
        words.insert(words.begin(), {"--tags", store("tags.csv", tags)});
        return plan(std::move(words));
    }
    Json document(const std::string& tags, std::vector<std::string> words = {}) const {
        words.emplace_back("--json");
        return Json::parse(planList(tags, std::move(words)).out);
    }

  private:
    fs::path directory_;
};

bool has(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

TEST_F(PlanCommandTest, BlocksAreShownWithTheirTagsAndReasons) {
    const Outcome outcome = planList(kTags);
    EXPECT_EQ(0, outcome.code);
    EXPECT_EQ("", outcome.err);
    EXPECT_TRUE(has(outcome.out,
                    "19200 baud, RTU, 10 bits a character; a reply ends by a silence "
                    "of 7.0 ms"))
        << outcome.out;
    EXPECT_TRUE(has(outcome.out, "1. node 1 HREG 400010..400014, every 200 ms: 23 characters"));
    EXPECT_TRUE(has(outcome.out, "     pressure, level, alarm\n"));
    EXPECT_TRUE(has(outcome.out, "(3 tags, 1 filler item between them: saves 30.1 ms)"));
    EXPECT_TRUE(has(outcome.out, "(wider than a request: cut into 2)"));
    EXPECT_TRUE(has(outcome.out, "one request a tag"));
    EXPECT_TRUE(has(outcome.out, "the wanted periods take "));
}

TEST_F(PlanCommandTest, TheDocumentHoldsEveryTagOnce) {
    const Json report = document(kTags);
    std::vector<std::string> names;
    for (const Json& block : report["blocks"])
        for (const Json& name : block["tags"])
            names.push_back(name);
    std::sort(names.begin(), names.end());
    const std::vector<std::string> all{"alarm", "counter", "level", "pressure", "pump", "recipe"};
    EXPECT_EQ(all, names);
    EXPECT_EQ(6, report["tags"]);
    EXPECT_EQ(true, report["reachable"]);
}

TEST_F(PlanCommandTest, SumsAreThoseOfTheBlocks) {
    const Json report = document(kTags);
    double once = 0;
    double load = 0;
    long characters = 0;
    for (const Json& block : report["blocks"]) {
        once += block["ms"].get<double>();
        load += block["load"].get<double>();
        characters += block["characters"].get<long>();
    }
    EXPECT_NEAR(once, report["plan"]["onceMs"].get<double>(), 1e-6);
    EXPECT_NEAR(load, report["plan"]["load"].get<double>(), 1e-9);
    EXPECT_EQ(characters, report["plan"]["characters"].get<long>());
    EXPECT_EQ(2U, report["nodes"].size());
}

TEST_F(PlanCommandTest, ThePlanIsBesideOneRequestATagAndFixedGaps) {
    const Json rivals = document(kTags)["rivals"];
    ASSERT_EQ(4U, rivals.size());
    EXPECT_EQ("one request a tag", rivals[0]["plan"]);
    EXPECT_EQ(7, rivals[0]["requests"]);
    EXPECT_EQ("fixed gap 0", rivals[1]["plan"]);
    EXPECT_EQ("fixed gap 50", rivals[3]["plan"]);
    for (const Json& rival : rivals)
        EXPECT_LE(document(kTags)["plan"]["load"].get<double>(), rival["load"].get<double>());
}

TEST_F(PlanCommandTest, ANodesPauseAndLimitCount) {
    const Json report = document(
        "name,uri\na,1?HREG?400001?short\nb,2?HREG?400001?short\nc,3?HREG?400001?short-4\n"
        "d,3?HREG?400005?short\n");
    ASSERT_EQ(4U, report["blocks"].size());
    EXPECT_NEAR(
        5, report["blocks"][1]["ms"].get<double>() - report["blocks"][0]["ms"].get<double>(), 1e-6);
    EXPECT_EQ(4, report["blocks"][2]["items"]);
}

TEST_F(PlanCommandTest, OptionsChangeTheLine) {
    const double silence = document(kTags)["plan"]["onceMs"];
    EXPECT_GT(silence, document(kTags, {"--frame-end", "length"})["plan"]["onceMs"].get<double>());
    EXPECT_LT(silence, document(kTags, {"--turnaround", "30"})["plan"]["onceMs"].get<double>());
    EXPECT_LT(silence, document(kTags, {"--min-gap", "20"})["plan"]["onceMs"].get<double>());
    EXPECT_EQ(9600, document(kTags, {"--baud", "9600"})["line"]["baud"]);
    EXPECT_EQ("ASCII", document(kTags, {"--ascii"})["line"]["mode"]);
}

TEST_F(PlanCommandTest, PeriodsThatCantBeReachedAreSaidWithTheTagsToBlame) {
    const std::string tags =
        "name,uri,period\nfast,1?HREG?400001?short-100,20\nslow,1?OUTP?1?boolean,10000\n";
    const Outcome outcome = planList(tags);
    EXPECT_EQ(1, outcome.code);
    EXPECT_TRUE(has(outcome.out, "the wanted periods can't be reached")) << outcome.out;
    EXPECT_TRUE(has(outcome.out, "to blame:\n     fast\n"));
    const Json report = document(tags);
    EXPECT_EQ(false, report["reachable"]);
    EXPECT_EQ(Json::array({"fast"}), report["toBlame"]);
    EXPECT_LT(1, report["plan"]["load"].get<double>());
}

TEST_F(PlanCommandTest, TheShortestPeriodIsWhatTheLineCanDo) {
    const std::string tags = "name,uri\na,1?HREG?400001?short-100\nb,1?OUTP?1?boolean\n";
    const double shortest = document(tags)["shortestPeriodMs"];
    const auto at = [&](double ms) {
        return planList(tags, {"--interval", std::to_string(static_cast<int>(ms))}).code;
    };
    EXPECT_EQ(0, at(shortest + 1));
    EXPECT_EQ(1, at(shortest));
}

TEST_F(PlanCommandTest, NamesAndUrisOnTheCommandLineAreEnough) {
    EXPECT_EQ(0, plan({"1?HREG?400001?short", "1?HREG?400002?short"}).code);
    const Json report = document(kTags, {"pump", "level"});
    EXPECT_EQ(2, report["tags"]);
}

TEST_F(PlanCommandTest, ARefusedTagIsNamedWithItsLine) {
    const Outcome outcome =
        planList("name,uri\ngood,1?HREG?400001?short\nbad,1?HREG?1?short\nworse,1?FOO?1?short\n");
    EXPECT_EQ(2, outcome.code);
    EXPECT_TRUE(has(outcome.err, "tags.csv:3: Tag URI error: 1?HREG?1?short - invalid offset"))
        << outcome.err;
    EXPECT_TRUE(has(outcome.err, "tags.csv:4: ")) << outcome.err;
    EXPECT_EQ("", outcome.out);
}

TEST_F(PlanCommandTest, DocumentationShowsTheRealOutput) {
    const std::string folder = SOURCE_FOLDER "/examples/plan/";
    const Outcome outcome = runInProcess({"plan", "--plugin", PLUGIN, "--config",
                                          folder + "line.cfg", "--tags", folder + "tags.csv"});
    std::ifstream file(SOURCE_FOLDER "/docs/plan.md");
    std::ostringstream page;
    page << file.rdbuf();
    std::istringstream lines(outcome.out);
    std::string shown;
    for (std::string line; std::getline(lines, line);)
        shown += (line.empty() ? "" : "    ") + line + '\n';
    EXPECT_TRUE(has(page.str(), shown)) << shown;
}

TEST_F(PlanCommandTest, NoTagsAreWrongUsage) {
    const Outcome outcome = plan({});
    EXPECT_EQ(2, outcome.code);
    EXPECT_EQ("mrtu: no tags: --tags FILE, or URIs\n", outcome.err);
}

TEST_F(PlanCommandTest, ARefusedConfigurationIsToldInTheDriversWords) {
    const Outcome outcome = planList(kTags, {"--set", "maxOptLen=-1"});
    EXPECT_EQ(2, outcome.code);
    EXPECT_TRUE(has(outcome.err, "configuration: parameter 'maxOptLen' out of range"))
        << outcome.err;
}

TEST_F(PlanCommandTest, ADocumentComesAlsoWhenThereIsNoPlan) {
    const Json report = document("name,uri\nbad,1?FOO?1?short\n");
    EXPECT_EQ(2, report["exitCode"]);
    EXPECT_LT(0U, report["errors"].size());
}

}  // namespace
}  // namespace cli
