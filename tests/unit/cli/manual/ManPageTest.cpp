#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "SampleProgram.h"

using cli::manual::manPage;
using testing::HasSubstr;
using testing::Not;

namespace manual_test {
namespace {

std::string pageOf(const std::string& path) {
    const auto program = sampleProgram();
    return manPage(commandOf(program, path), program, "1.2");
}

TEST(ManPageTest, NamesTheCommandWithASummaryThatIsNoSentence) {
    EXPECT_THAT(pageOf(""), HasSubstr(".TH TOOL 1 \"\" \"tool 1.2\" \"User Commands\"\n"
                                      ".SH NAME\ntool \\- does things. And more\n"));
    EXPECT_THAT(pageOf("fetch"), HasSubstr(".SH NAME\ntool\\-fetch \\- fetch it\\(aqs [all]\n"));
}

TEST(ManPageTest, TheSynopsisTellsWhatIsNeeded) {
    EXPECT_THAT(pageOf("fetch"),
                HasSubstr("\\fBtool fetch\\fR [\\fIOPTION\\fR]... \\fIURI\\fR...\n"));
    EXPECT_THAT(pageOf("store"), HasSubstr("\\fICOMMAND\\fR\n"));
}

TEST(ManPageTest, OptionsStandUnderTheirGroup) {
    EXPECT_THAT(pageOf("fetch"), HasSubstr(".SS Line\n.TP\n\\fB\\-\\-parity\\fR \\fI"));
    EXPECT_THAT(pageOf("fetch"), HasSubstr("\\fB\\-\\-file\\fR \\fIFILE\\fR\nWhere: a path\n"));
}

TEST(ManPageTest, ChoicesAreListedUnlessTheHelpTextDoes) {
    EXPECT_THAT(pageOf("fetch"), HasSubstr("One of \\fB"));
    EXPECT_THAT(pageOf("fetch"), Not(HasSubstr("One of \\fBnone")));
}

TEST(ManPageTest, ExamplesStandAsTheyAreTypedWithNothingTakenForARequest) {
    EXPECT_THAT(pageOf("fetch"),
                HasSubstr(".SH EXAMPLES\n.PP\n.nf\ntool fetch \\(aq1?A.\\-2\\(aq \\e\n\\&.dotted\n"
                          ".fi\n"));
}

TEST(ManPageTest, EveryPageTellsTheExitCodesUnderTheUsualTitle) {
    EXPECT_THAT(pageOf("store"), HasSubstr(".SH EXIT STATUS\n.PP\n.nf\n0  done\n"));
    EXPECT_THAT(pageOf(""), HasSubstr(".SH EXIT STATUS\n.PP\n.nf\n0  done\n2  wrong\n.fi\n"));
}

TEST(ManPageTest, InnerCommandsStandOnThePageOfTheirParent) {
    EXPECT_THAT(pageOf("store"), HasSubstr(".SS tool store set\n"));
    EXPECT_THAT(pageOf(""), Not(HasSubstr("store set")));
}

TEST(ManPageTest, PagesNameEachOtherButNotThemselves) {
    const std::string page = pageOf("store");
    const std::string seeAlso = page.substr(page.find(".SH SEE ALSO"));
    EXPECT_THAT(seeAlso, HasSubstr(".BR tool (1) ,\n.BR tool\\-fetch (1)\n"));
    EXPECT_THAT(seeAlso, Not(HasSubstr("tool\\-store")));
}

}  // namespace
}  // namespace manual_test
