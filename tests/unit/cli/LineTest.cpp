// What a line does to replies, and what the command makes of it: echoes, pauses, late answers.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/unit/cli/Child.h"

namespace {

using cli_test::mrtu;
using cli_test::Outcome;
using cli_test::RunningSim;
using testing::HasSubstr;

using Words = std::vector<std::string>;

Words operator+(Words words, const Words& more) {
    words.insert(words.end(), more.begin(), more.end());
    return words;
}

Outcome readOn(const RunningSim& sim, const Words& options, const Words& uris) {
    return mrtu(Words{"read", "--port", sim.device()} + options + uris);
}

const Words kByLength{"--frame-end", "length"};

/// The request for it is 04 03 02 B0 00 01 84 00, which begins with a whole reply: B0 00 is the
/// value, 01 84 its check.
const std::string kTwinUri = "4?HREG?400689?unsignedShort";
constexpr const char* kEcho = "040302B000018400";
constexpr const char* kEchoedValue = "45056";

RunningSim echoingLine(const std::string& fault) {
    return RunningSim({"--node", "4", "--fault", fault + kEcho + ",times=9"});
}

TEST(LineTest, BothFrameEndsReadWhatTheDeviceHolds) {
    for (const Words& mode : {Words{}, Words{"--ascii"}}) {
        for (const char* const end : {"silence", "length", "LENGTH"}) {
            const Outcome outcome =
                mrtu(Words{"read", "--sim", "--frame-end", end} + mode +
                     Words{"1?HREG?400001?unsignedShort", "1?OUTP?1?boolean-8"});
            EXPECT_EQ("1?HREG?400001?unsignedShort = 1000\n1?OUTP?1?boolean-8 = 0,0,1,0,0,1,0,0\n",
                      outcome.out)
                << end;
            EXPECT_EQ("", outcome.err);
            EXPECT_EQ(0, outcome.exitCode);
        }
    }
}

TEST(LineTest, EveryLineCommandTakesTheFrameEnd) {
    EXPECT_EQ(
        0, mrtu(Words{"write", "--sim", "--verify"} + kByLength + Words{"1?HREG?400001?short=-5"})
               .exitCode);
    EXPECT_EQ(0, mrtu(Words{"console", "--sim"} + kByLength + Words{"getmaxtm"}).exitCode);
    EXPECT_EQ(0, mrtu(Words{"override", "list", "--sim"} + kByLength).exitCode);
}

TEST(LineTest, AnotherFrameEndIsRefusedWithWhatThereIs) {
    const Outcome outcome = mrtu({"read", "--sim", "--frame-end", "lenght", kTwinUri});
    EXPECT_EQ(2, outcome.exitCode);
    EXPECT_THAT(outcome.err, HasSubstr("'lenght' is not one of silence, length; did you mean "
                                       "'length'?"));
}

TEST(LineTest, AnEchoAloneIsNoReply) {
    const RunningSim line = echoingLine("send=");
    const Outcome outcome = readOn(line, {}, {kTwinUri});
    EXPECT_EQ("", outcome.out);
    EXPECT_NE(0, outcome.exitCode);
}

TEST(LineTest, AnEchoInFrontOfTheReplyIsNotTakenForIt) {
    const RunningSim line = echoingLine("noise=");
    const Outcome outcome = readOn(line, {}, {kTwinUri});
    EXPECT_THAT(outcome.out, testing::Not(HasSubstr(kEchoedValue)));
    EXPECT_NE(0, outcome.exitCode);
}

// Why the end by length is not the default, and the help warns of it.
TEST(LineTest, TheEndByLengthTakesAnEchoForAReply) {
    // The last byte of the echo a moment behind the others, as on a line with a speed.
    const RunningSim line = echoingLine("drip=7/30,send=");
    EXPECT_EQ(kTwinUri + " = " + kEchoedValue + "\n", readOn(line, kByLength, {kTwinUri}).out);
}

TEST(LineTest, APauseInsideAReplyDoesNotCutItByLength) {
    const RunningSim line({"--fault", "drip=3/60"});
    const Outcome outcome =
        readOn(line, kByLength + Words{"--timeout", "1000"}, {"1?HREG?400001?unsignedShort"});
    EXPECT_EQ("1?HREG?400001?unsignedShort = 1000\n", outcome.out);
    EXPECT_EQ("", outcome.err);
}

TEST(LineTest, AReplyThatAPauseHasCutIsAnsweredWithAdviceOnce) {
    const RunningSim line({"--fault", "drip=4/60", "--fault", "delay=60", "--fault", "drip=4/60",
                           "--fault", "delay=60"});
    const Outcome outcome = readOn(line, {"--timeout", "1000"},
                                   {"1?HREG?400001?unsignedShort", "1?HREG?400002?unsignedShort"});
    const std::size_t advice = outcome.err.find("--frame-end length keeps it whole\n");
    ASSERT_NE(std::string::npos, advice) << outcome.err;
    EXPECT_THAT(outcome.err, HasSubstr("mrtu: com1: a reply paused for "));
    EXPECT_EQ(std::string::npos, outcome.err.find("--frame-end", advice + 1)) << outcome.err;
}

TEST(LineTest, ALateNodeIsNamedWithTheTimeoutToSetAndDeliversNoOthersValue) {
    const RunningSim line({"--fault", "delay=150,times=99"});
    const Outcome outcome = readOn(line, {"--timeout", "100", "--set", "repeat=2", "--trace"},
                                   {"1?HREG?400001?unsignedShort", "1?HREG?400002?unsignedShort",
                                    "1?HREG?400003?unsignedShort"});
    EXPECT_THAT(outcome.err, HasSubstr("mrtu: com1: node 1 answers up to "));
    EXPECT_THAT(outcome.err, HasSubstr("set the timeout to "));
    EXPECT_THAT(outcome.err, HasSubstr(" (late, thrown away)\n"));
    // Whatever is printed is the register's own.
    for (const char* const wrong : {"400001?unsignedShort = 1001", "400001?unsignedShort = 1002",
                                    "400002?unsignedShort = 1000", "400002?unsignedShort = 1002",
                                    "400003?unsignedShort = 1000", "400003?unsignedShort = 1001"})
        EXPECT_THAT(outcome.out, testing::Not(HasSubstr(wrong)));
}

}  // namespace
