// Configurations and what is found in them, with places.
#include "lint/LintConfig.h"

#include <gtest/gtest.h>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

using settings::Place;
using settings::ScannedConfig;

Findings lint(const std::string& text) {
    return lintConfig(settings::scanConfig("cfg", text), sampleDescription());
}

TEST(LintConfigTest, FindsWhatTheDriverPassesOver) {
    struct Case {
        const char* text;
        const char* places;
    };
    const Case cases[] = {
        {"CfgVer=1 defNodeId=1 txMode=RTU uart=com1 Node2::timeout=5", ""},
        {"no marker timout=1", ""},
        {"CfgVer=1 timout=500", "unknown-key@1:10"},
        {"CfgVer=1\n  Timeout=5", "unknown-key@2:3"},
        {"CfgVer=1 Node1::timout=5", "unknown-key@1:10"},
        {"CfgVer=1 timeout=1\ntimeout=1", "duplicate-key@2:1"},
        {"CfgVer=1 Node1::timeout=1 timeout=2 Node2::timeout=3", ""},
        {"CfgVer=1 Node1::timeout=1 Node1::timeout=2", "duplicate-key@1:27"},
        {"CfgVer=1 timeout = 5", "not-an-item@1:10 not-an-item@1:18 not-an-item@1:20"},
        {"CfgVer=10 timeout=5", "not-an-item@1:9"},
        {"# line 4\nCfgVer=1 timeout=5", "ignored-text@1:1"},
        {"CfgVer=1 timeout=5\nCfgVer=1 timout=6", "ignored-text@2:1"},
        {"CfgVer=1 Node01::timeout=5", "ignored-node@1:10"},
        {"CfgVer=1 Node::timeout=5", "ignored-node@1:10"},
        {"CfgVer=1 NodeA::timeout=5", "ignored-node@1:10"},
        {"CfgVer=1 Node99999999999::timeout=5", "ignored-node@1:10"},
        {"CfgVer=1 Node1::uart=com1", "ignored-node@1:10"},
        {"CfgVer=1 Node255::timeout=5", "unusable-node@1:10"},
        {"CfgVer=1 Node0::timeout=5\nNode257::timeout=5 Node257::model=1",
         "unusable-node@1:10 unusable-node@2:1"},
        {"CfgVer=1 Node254::timeout=5", ""},
        {"CfgVer=1 timeout=0500", "octal-number@1:18"},
        {"CfgVer=1 timeout=0x10", ""},
        {"CfgVer=1 timeout=5s", "not-a-number@1:18"},
        {"CfgVer=1 timeout=", "not-a-number@1:18"},
        {"CfgVer=1 maxOptLen=251", "out-of-range@1:20"},
        {"CfgVer=1 maxOptLen=250", ""},
        {"CfgVer=1 txMode=rtu", "unlisted-value@1:17"},
        {"CfgVer=1 stopbits=3", "unlisted-value@1:19"},
        {"CfgVer=1 presetFunction=6", "unlisted-value@1:25"},
        {"CfgVer=1 uart=com99 parity=mark", ""},
        {"CfgVer=1 model=2", "unknown-model@1:16"},
        {"CfgVer=1 Node4::model=Enron", "unknown-model@1:23"},
    };
    for (const Case& each : cases)
        EXPECT_EQ(each.places, placesOf(lint(each.text))) << each.text;
}

TEST(LintConfigTest, DataBitsWithoutEffectAreFound) {
    struct Case {
        const char* text;
        const char* places;
    };
    const Case cases[] = {
        {"CfgVer=1 txMode=RTU bits=8", "ignored-key@1:21"},
        {"CfgVer=1 txMode=RTU bits=7", "ignored-key@1:21"},
        {"CfgVer=1 txMode=ASCII bits=7", ""},
        // Without txMode the driver demands the key, though it takes 8 whatever it says.
        {"CfgVer=1 bits=8", ""},
        {"CfgVer=1 bits=7", "ignored-key@1:10"},
    };
    for (const Case& each : cases)
        EXPECT_EQ(each.places, placesOf(lint(each.text))) << each.text;
}

TEST(LintConfigTest, NearestKnownKeyIsSuggested) {
    EXPECT_EQ("did you mean 'timeout'?", lint("CfgVer=1 timout=1").at(0).suggestion);
    EXPECT_EQ("'mrtu describe parameters' lists the keys",
              lint("CfgVer=1 weather=1").at(0).suggestion);
}

TEST(LintConfigTest, EveryWarningHasASuggestion) {
    for (const Finding& finding :
         lint("x CfgVer=1 a b=1 timeout=01 timeout=2 Node01::timeout=1 Node1::uart=a bits=7 "
              "maxOptLen=999 stopbits=3x model=9 CfgVer=2")) {
        EXPECT_EQ(Severity::Warning, finding.severity);
        EXPECT_FALSE(finding.message.empty()) << finding.rule;
        EXPECT_FALSE(finding.suggestion.empty()) << finding.rule;
    }
}

TEST(LintConfigTest, DuplicateNamesTheValueThatCounts) {
    EXPECT_EQ("'timeout' is given twice; the first value, '7' in line 2, counts",
              lint("CfgVer=1\ntimeout=7 timeout=8").at(0).message);
}

TEST(LintConfigTest, RefusalStandsAtTheItemThatTheMessageNames) {
    const ScannedConfig config = settings::scanConfig("cfg", "CfgVer=1\nparity=evn");
    const Finding finding =
        configRefusal(config, sampleDescription(), "Parser: parameter 'parity' has invalid value");
    EXPECT_EQ(Severity::Error, finding.severity);
    EXPECT_EQ((Place{"cfg", 2, 8}), finding.place);
    EXPECT_EQ("e.g. parity=even; choices: none, even, odd", finding.suggestion);
}

TEST(LintConfigTest, RefusalMissingKeyIsToBeAddedAtTheEnd) {
    const ScannedConfig config = settings::scanConfig("cfg", "CfgVer=1 timeout=5");
    const Finding finding =
        configRefusal(config, sampleDescription(), "Parser: parameter 'uart' is not found");
    EXPECT_EQ((Place{"cfg", 1, 19}), finding.place);
    EXPECT_EQ("add e.g. uart=com1; choices: com1, com2", finding.suggestion);
}

TEST(LintConfigTest, RefusalMissingMarkerIsToBeAddedAtTheStart) {
    const Finding finding = configRefusal(settings::scanConfig("cfg", "\n\ntimeout=5"),
                                          sampleDescription(), "Parser: unknown format");
    EXPECT_EQ((Place{"cfg", 1, 1}), finding.place);
    EXPECT_EQ("begin with CfgVer=1", finding.suggestion);
}

TEST(LintConfigTest, EveryItemOfALongTextIsLookedAtOnce) {
    // A look at the whole text for each of its items would be forty thousand times a megabyte.
    std::string text = "CfgVer=1\n";
    for (int node = 1; node <= 40000; ++node)
        text += "Node" + std::to_string(node) + "::timeout=5\n";
    const Findings findings = lint(text);
    ASSERT_EQ(40000U - 254U, findings.size()) << "numbers that no device has";
    EXPECT_EQ((Place{"cfg", 40001, 1}), findings.back().place);
    EXPECT_EQ(40000U, surroundingsOf(text, sampleDescription()).nodes.size());
}

}  // namespace
}  // namespace lint
