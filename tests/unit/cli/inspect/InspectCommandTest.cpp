// The sub-command as it is typed.
#include <gtest/gtest.h>

#include <utility>
#include <vector>

#include "tests/unit/cli/InProcess.h"
#include "tests/unit/cli/inspect/SampleFiles.h"
#include "values/JsonValues.h"

namespace cli {
namespace {

using values::Json;

Outcome inspect(std::vector<std::string> words) {
    words.insert(words.begin(), "inspect");
    return runInProcess(std::move(words));
}

bool has(const std::string& text, const std::string& part) {
    return text.find(part) != std::string::npos;
}

TEST(InspectCommandTest, PluginForThisMachineIsAskedItselfWhenWanted) {
    const Outcome outcome = inspect({"--load", PLUGIN});
    EXPECT_EQ(0, outcome.code) << outcome.err;
    for (const char* line :
         {"entry          present\n", "missing        nothing\n", "name           MRTU\n",
          "display name   Modbus RTU\n", "type           184\n", "description    compressedXML="})
        EXPECT_TRUE(has(outcome.out, line)) << line << "in\n" << outcome.out;
}

TEST(InspectCommandTest, JsonHoldsTheSame) {
    const Outcome outcome = inspect({"--json", "--load", PLUGIN});
    ASSERT_EQ(0, outcome.code) << outcome.err;
    const Json json = Json::parse(outcome.out);
    EXPECT_EQ(PLUGIN, json.at("file"));
    EXPECT_EQ(true, json.at("entry"));
    EXPECT_EQ(Json::array(), json.at("missing"));
    EXPECT_EQ("MRTU", json.at("identity").at("name"));
    EXPECT_EQ(184, json.at("identity").at("type"));
    EXPECT_EQ(126, json.at("identity").at("version"));
    EXPECT_FALSE(json.contains("notLoaded"));
}

TEST(InspectCommandTest, ForeignFileIsNeverExecuted) {
    const SampleFiles files;
    const std::string engine = files.foreignCopyOf(ENGINE);
    const Outcome outcome = inspect({"--json", "--load", files.foreignCopyOf(PLUGIN)});
    const Json json = Json::parse(outcome.out);
    EXPECT_EQ("64-bit ARM", json.at("architecture"));
    EXPECT_EQ(nullptr, json.at("identity"));
    EXPECT_EQ("another architecture; nothing of it was executed", json.at("notLoaded"));
}

TEST(InspectCommandTest, LibraryWithoutEntryIsNotLoaded) {
    // Its constructor would end this process.
    const Outcome outcome = inspect({"--load", OTHER_LIBRARY});
    EXPECT_EQ(1, outcome.code);
    EXPECT_TRUE(has(outcome.out, "entry          missing\n")) << outcome.out;
    EXPECT_TRUE(has(outcome.out, "not loaded     it is not complete\n")) << outcome.out;
}

TEST(InspectCommandTest, PluginWithoutEngineIsNamedIncomplete) {
    const SampleFiles files;
    const Outcome outcome = inspect({files.copyOf(PLUGIN)});
    EXPECT_EQ(1, outcome.code);
    EXPECT_TRUE(has(outcome.out, "needs          libprotgen.so (not found here)\n")) << outcome.out;
    EXPECT_TRUE(has(outcome.out, "ProtgenTag::PackedLen() const\n")) << outcome.out;
}

TEST(InspectCommandTest, NothingOfTheFileIsExecutedUnlessWanted) {
    // Its constructor would end this process.
    const Outcome outcome = inspect({DEADLY_PLUGIN});
    EXPECT_EQ(0, outcome.code) << outcome.err;
    EXPECT_EQ("", outcome.err);
    EXPECT_TRUE(has(outcome.out, "entry          present\n")) << outcome.out;
    EXPECT_TRUE(has(outcome.out, "not loaded     only read; --load runs its start-up code"))
        << outcome.out;
    EXPECT_TRUE(Json::parse(inspect({"--json", DEADLY_PLUGIN}).out).contains("notLoaded"));
}

TEST(InspectCommandTest, UnknownProtocolIsAFailure) {
    const Outcome outcome = inspect({"--load", "--protocol", "MTCP", PLUGIN});
    EXPECT_EQ(1, outcome.code);
    EXPECT_TRUE(has(outcome.out, "not loaded     ")) << outcome.out;
}

TEST(InspectCommandTest, FileThatCannotBeReadIsComplainedAbout) {
    const Outcome outcome = inspect({"/nonexistent.so"});
    EXPECT_EQ(1, outcome.code);
    EXPECT_EQ("mrtu: /nonexistent.so: No such file or directory\n", outcome.err);
    EXPECT_EQ("", outcome.out);
    EXPECT_EQ(2, inspect({}).code);
}

}  // namespace
}  // namespace cli
