#include "poll/CostModel.h"

#include <gtest/gtest.h>

namespace poll {
namespace {

TEST(CostModelTest, NodesWithoutATurnaroundOfTheirOwnTakeTheLines) {
    EXPECT_EQ(std::chrono::nanoseconds{0}, CostModel{}.turnaround);
}

}  // namespace
}  // namespace poll
