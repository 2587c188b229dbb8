#include "poll/Histogram.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

using std::chrono::hours;
using std::chrono::microseconds;
using std::chrono::milliseconds;
using std::chrono::nanoseconds;

TEST(HistogramTest, NothingTookNoTime) {
    const Histogram histogram;
    EXPECT_EQ(nanoseconds{0}, histogram.quantile(0.5));
    EXPECT_EQ(nanoseconds{0}, histogram.max());
}

TEST(HistogramTest, QuantilesAreNeverTooShortAndAtMostAnEighthTooLong) {
    for (int micros = 8; micros < 4'000'000; micros += micros / 7 + 1) {
        Histogram histogram;
        histogram.add(microseconds{micros});
        histogram.add(hours{1});
        const auto median = histogram.quantile(0.5);
        EXPECT_GE(median, microseconds{micros});
        EXPECT_LE(median, nanoseconds{microseconds{micros}} * 9 / 8) << micros;
    }
}

TEST(HistogramTest, OneOfAHundredIsTheNinetyNinthPercentilesAffairOnlyBeyondIt) {
    Histogram histogram;
    for (int i = 0; i < 99; ++i)
        histogram.add(milliseconds{10});
    histogram.add(milliseconds{500});
    EXPECT_LE(histogram.quantile(0.99), microseconds{11250});
    EXPECT_EQ(milliseconds{500}, histogram.quantile(1.0));
    EXPECT_EQ(100U, histogram.count());
    histogram.add(milliseconds{500});
    EXPECT_EQ(milliseconds{500}, histogram.quantile(0.99));
}

TEST(HistogramTest, TimesBeyondItsRangeCountAsItsLongest) {
    Histogram histogram;
    histogram.add(hours{1000});
    histogram.add(nanoseconds{-1});
    EXPECT_EQ(hours{1000}, histogram.max());
    EXPECT_EQ(2U, histogram.count());
}

}  // namespace
}  // namespace poll
