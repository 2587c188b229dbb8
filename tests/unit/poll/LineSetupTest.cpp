#include "poll/LineSetup.h"

#include <gtest/gtest.h>

#include "tests/unit/poll/FakeSource.h"

namespace poll {
namespace {

LineSetup sound() {
    SetupBuilder builder;
    builder.block(1, 0, 2, milliseconds{100}).block(2, 0, 2, milliseconds{100});
    return builder.setup();
}

TEST(LineSetupTest, ASoundSetupHasNoComplaint) {
    EXPECT_EQ(std::nullopt, complaintAbout({sound()}));
    EXPECT_EQ(std::nullopt, complaintAbout({}));
}

TEST(LineSetupTest, EveryComplaintNamesLineAndTag) {
    struct Case {
        std::string expected;
        void (*spoil)(LineSetup&);
    };
    const Case cases[] = {
        {"com1: 3 names and 4 URIs for 4 tags", [](LineSetup& s) { s.tagNames.pop_back(); }},
        {"com1: tag t0 is polled twice", [](LineSetup& s) { s.tagNames[1] = "t0"; }},
        {"com1: tag t1 stands in two blocks",
         [](LineSetup& s) {
             s.blocks[0].tags = {1, 1};
         }},
        {"com1: tag t2 lies outside its block",
         [](LineSetup& s) {
             s.blocks[0].tags = {0, 2};
         }},
        {"com1: tag t1 lies outside its block", [](LineSetup& s) { s.blocks[0].items = 1; }},
        {"com1: a block of a tag that is not in the list",
         [](LineSetup& s) { s.blocks[0].tags = {9}; }},
        {"com1: a block without tags or period",
         [](LineSetup& s) { s.blocks[1].period = milliseconds{0}; }},
        {"com1: pauses and numbers of failures must be above 0",
         [](LineSetup& s) { s.patience.failures = 0; }},
    };
    for (const Case& one : cases) {
        LineSetup setup = sound();
        one.spoil(setup);
        EXPECT_EQ(one.expected, complaintAbout({setup}));
    }
    EXPECT_EQ("com1: the line is polled twice", complaintAbout({sound(), sound()}));
}

TEST(LineSetupTest, WorkIsTheSameUnlessThePollingWouldDiffer) {
    LineSetup reworded = sound();
    reworded.blocks[0].reason = "another";
    EXPECT_TRUE(sameWork(sound(), reworded));
    LineSetup other = sound();
    other.configuration = "baud=9600";
    EXPECT_FALSE(sameWork(sound(), other));
    other = sound();
    other.blocks.pop_back();
    EXPECT_FALSE(sameWork(sound(), other));
    other = sound();
    other.uris[0] = "another";
    EXPECT_FALSE(sameWork(sound(), other));
}

}  // namespace
}  // namespace poll
