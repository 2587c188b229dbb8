// Writes of several threads through one protocol object.
#include <gtest/gtest.h>

#include <array>
#include <functional>
#include <thread>

#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

constexpr int kRounds = 10000;

class EngineThreadsTest : public testing::Test {
  protected:
    EngineThreadsTest() {
        driver_.setLogging(false);
        driver_.onCall(std::this_thread::yield);
        driver_.memory("REG").setBytes(40, {0, 0, 0, 0});
    }

    static void together(const std::function<void()>& one, const std::function<void()>& other) {
        std::thread first(one);
        std::thread second(other);
        first.join();
        second.join();
    }

    FakeDriver driver_;
};

}  // namespace

// Each thread reads its own bit back after every write: no one else may change it.
TEST_F(EngineThreadsTest, WritingDifferentBitsOfOneRegisterLosesNoUpdate) {
    std::array<int, 2> lost{};
    const auto flip = [this](const ITag* tag, int& mistakes) {
        for (int round = 0; round <= kRounds; ++round) {
            const auto wanted = static_cast<unsigned char>(round % 2 == 0 ? 1 : 0);
            unsigned char found = 2;
            if (driver_.Write(tag, &wanted) == 0) ++mistakes;
            if (driver_.Read(tag, &found) == 0 || found != wanted) ++mistakes;
        }
    };
    const ITag* low = driver_.tag("1?REG?40.3?boolean");
    const ITag* high = driver_.tag("1?REG?40.12?boolean");
    together([&] { flip(low, lost[0]); }, [&] { flip(high, lost[1]); });
    EXPECT_EQ(0, lost[0]);
    EXPECT_EQ(0, lost[1]);
    EXPECT_EQ((std::vector<unsigned char>{0x08, 0x10}), driver_.memory("REG").bytes(40, 2));
}

// Three bytes are written with a read of both registers in front: its write back must not bring
// the old fourth byte back when the other thread has written all four meanwhile.
TEST_F(EngineThreadsTest, WholeWriteIsNotUndoneByAWriteBack) {
    const ITag* threeBytes = driver_.tag("1?REG?40?string-3");
    const ITag* fourBytes = driver_.tag("1?REG?40?unsignedInt");
    std::array<int, 2> lost{};
    const auto writePart = [&] {
        const std::array<unsigned char, 3> value = {1, 2, 3};
        for (int round = 0; round < kRounds; ++round) {
            if (driver_.Write(threeBytes, value.data()) == 0) ++lost[0];
        }
    };
    const auto writeWhole = [&] {
        for (int round = 0; round < kRounds; ++round) {
            const auto mark = static_cast<unsigned char>(round);
            const std::array<unsigned char, 4> value = {mark, mark, mark, mark};
            std::array<unsigned char, 4> found{};
            if (driver_.Write(fourBytes, value.data()) == 0) ++lost[1];
            if (driver_.Read(fourBytes, found.data()) == 0 || found[3] != mark) ++lost[1];
        }
    };
    together(writePart, writeWhole);
    EXPECT_EQ(0, lost[0]);
    EXPECT_EQ(0, lost[1]);
}

TEST_F(EngineThreadsTest, WritingDifferentItemsOfOneRegisterLosesNoUpdate) {
    const ITag* array = driver_.tag("1?REG?40?unsignedByte-4");
    std::array<int, 2> lost{};
    const auto count = [this, array](int index, int& mistakes) {
        for (int round = 1; round <= kRounds; ++round) {
            const auto wanted = static_cast<unsigned char>(round);
            unsigned char found = 0;
            if (driver_.writeArrayItem(array, index, &wanted) == 0) ++mistakes;
            if (driver_.readArrayItem(array, index, &found) == 0 || found != wanted) ++mistakes;
        }
    };
    together([&] { count(2, lost[0]); }, [&] { count(3, lost[1]); });
    EXPECT_EQ(0, lost[0]);
    EXPECT_EQ(0, lost[1]);
}
