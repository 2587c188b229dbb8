#include "runtime/LastAct.h"

#include <gtest/gtest.h>

#include <memory>
#include <vector>

namespace {

using runtime::LastAct;

int g_undone = 0;

void undo(const void* what) noexcept {
    g_undone += *static_cast<const int*>(what);
}

int undoneNow() {
    g_undone = 0;
    runtime::runLastActs();
    return g_undone;
}

TEST(LastActTest, RunsWhileItIsAnnounced) {
    const int one = 1;
    const int ten = 10;
    EXPECT_EQ(0, undoneNow());
    const LastAct first(undo, &one);
    {
        const LastAct second(undo, &ten);
        EXPECT_EQ(11, undoneNow());
        EXPECT_EQ(11, undoneNow());
    }
    EXPECT_EQ(1, undoneNow());
}

TEST(LastActTest, MoreThanThereIsRoomForAreNotNoted) {
    const int one = 1;
    std::vector<std::unique_ptr<LastAct>> acts;
    for (int count = 0; count < runtime::kLastActs + 3; ++count)
        acts.push_back(std::make_unique<LastAct>(undo, &one));
    EXPECT_EQ(runtime::kLastActs, undoneNow());
    acts.clear();
    EXPECT_EQ(0, undoneNow());
    const LastAct again(undo, &one);
    EXPECT_EQ(1, undoneNow());
}

}  // namespace
