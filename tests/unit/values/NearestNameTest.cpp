#include "values/NearestName.h"

#include <gtest/gtest.h>

namespace values {
namespace {

TEST(NearestNameTest, DistanceCountsEdits) {
    struct Case {
        const char* a;
        const char* b;
        std::size_t distance;
    };
    const Case cases[] = {
        {"", "", 0},
        {"", "ab", 2},
        {"ab", "", 2},
        {"same", "same", 0},
        {"timout", "timeout", 1},
        {"timeuot", "timeout", 1},
        {"HREG", "hreg", 0},
        {"kitten", "sitting", 3},
    };
    for (const Case& each : cases) {
        EXPECT_EQ(each.distance, editDistance(each.a, each.b)) << each.a << ' ' << each.b;
        EXPECT_EQ(each.distance, editDistance(each.b, each.a)) << each.b << ' ' << each.a;
    }
}

TEST(NearestNameTest, IsTheFirstOfTheNearest) {
    EXPECT_EQ("timeout", nearestName("timout", {"delay", "timeout", "timeouts"}));
    EXPECT_EQ("xb", nearestName("ab", {"xb", "ax"}));
}

TEST(NearestNameTest, IsEmptyWhereNothingIsNear) {
    EXPECT_EQ("", nearestName("weather", {"timeout", "delay"}));
    EXPECT_EQ("", nearestName("xy", {"ab", "1"})) << "every character would change";
    EXPECT_EQ("", nearestName("x", {}));
}

}  // namespace
}  // namespace values
