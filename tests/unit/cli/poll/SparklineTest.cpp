// Values as bars.
#include "cli/poll/Sparkline.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace {

using cli::sparkline;

TEST(SparklineTest, ScalesToTheSmallestAndTheLargest) {
    EXPECT_EQ("▁▂▃▄▅▆▇█", sparkline({0, 1, 2, 3, 4, 5, 6, 7}, 8, true));
    EXPECT_EQ("█▁", sparkline({-100, -200}, 8, true));
    EXPECT_EQ("_#", sparkline({1, 2}, 8, false));
}

TEST(SparklineTest, IsFlatWhereNothingChanges) {
    EXPECT_EQ("▁▁▁", sparkline({5, 5, 5}, 8, true));
    EXPECT_EQ("", sparkline({}, 8, true));
}

TEST(SparklineTest, ShowsTheLastValuesOnly) {
    EXPECT_EQ("▁█", sparkline({1000, 1, 2}, 2, true));
}

TEST(SparklineTest, SurvivesWhatIsNoNumberAndTheLargestOnes) {
    const double most = std::numeric_limits<double>::max();
    EXPECT_EQ("▁ █ ", sparkline({-most, std::nan(""), most, INFINITY}, 8, true));
}

}  // namespace
