// Which writes wait for a write that takes its time, as every write to a silent node does. A write
// that waited where it must not would keep these tests from ending.
#include <gtest/gtest.h>

#include <array>
#include <atomic>
#include <functional>
#include <latch>
#include <thread>

#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

class WaitingTest : public testing::Test {
  protected:
    WaitingTest() { driver_.setLogging(false); }

    /// While `slow` hangs in its first hook call, the test's own thread runs `quick`.
    void whileHanging(const std::function<void()>& slow, const std::function<void()>& quick) {
        std::latch hanging(1);
        std::latch release(1);
        std::thread::id slowThread;
        bool first = true;
        driver_.onCall([&] {
            if (std::this_thread::get_id() != slowThread || !first) return;
            first = false;
            hanging.count_down();
            release.wait();
        });
        std::latch known(1);
        std::thread thread([&] {
            known.wait();
            slow();
        });
        slowThread = thread.get_id();
        known.count_down();
        hanging.wait();
        quick();
        release.count_down();
        thread.join();
        driver_.onCall(nullptr);
    }

    void write(const char* uri) {
        const std::array<unsigned char, 600> value{};
        EXPECT_NE(0, driver_.Write(driver_.tag(uri), value.data())) << uri;
    }
    std::function<void()> writing(const char* uri) {
        return [this, uri] { write(uri); };
    }

    FakeDriver driver_;
};

constexpr const char* kBit = "1?REG?40.3?boolean";
constexpr const char* kWord = "1?REG?40?short";

}  // namespace

TEST_F(WaitingTest, OwnAreasOfTheDriverWaitForNobody) {
    for (const char* slow : {kBit, kWord, "1?REG?40?short-200", "1?AREA?0?unsignedInt"})
        whileHanging(writing(slow), [this] {
            write("1?AREA?0?unsignedInt");
            write("1?FLAG?0?boolean");
            write("1?AREA?0.1?boolean");
        });
}

TEST_F(WaitingTest, WholeWritesWaitForNoWholeWrite) {
    whileHanging(writing(kWord), [this] {
        write(kWord);
        write("1?REG?40?short-200");
        write("1?COIL?7?boolean");
        write("2?REG?40.3?boolean");
    });
}

TEST_F(WaitingTest, ChangeKeepsNobodyOutOfOtherNodesAndAreas) {
    whileHanging(writing(kBit), [this] {
        for (const char* uri : {"2?REG?40?short", "2?REG?40.3?boolean", "1?LONG?40.3?boolean",
                                "1?COIL?40?boolean-9", "9?REG?40?string-3"})
            write(uri);
    });
}

TEST_F(WaitingTest, ReadsWaitForNoWrite) {
    whileHanging(writing(kBit), [this] {
        std::array<unsigned char, 2> value{};
        EXPECT_NE(0, driver_.Read(driver_.tag(kWord), value.data()));
    });
}

/// What a write back would bring back is written before or after it, never in between.
TEST_F(WaitingTest, WholeWriteOfTheSameAreaWaitsForTheWriteBack) {
    driver_.memory("REG").setBytes(40, {0, 0});
    std::thread whole;
    std::atomic<int> calls = 0;
    driver_.onCall([&] {
        if (++calls != 1) return;
        // The read of the change. The other thread gets as far as it can; it must not write now.
        whole = std::thread([this] {
            const std::array<unsigned char, 2> value = {0xFF, 0xFF};
            EXPECT_NE(0, driver_.Write(driver_.tag("1?REG?40?short"), value.data()));
        });
        for (int turns = 0; turns < 1000; ++turns)
            std::this_thread::yield();
    });
    const unsigned char off = 0;
    EXPECT_NE(0, driver_.Write(driver_.tag(kBit), &off));
    whole.join();
    EXPECT_EQ((std::vector<unsigned char>{0xFF, 0xFF}), driver_.memory("REG").bytes(40, 2));
}

TEST_F(WaitingTest, ItemsOfADriverWithoutItemAddressesLoseNoUpdate) {
    driver_.setArrayItemByTag(0);
    driver_.onCall(std::this_thread::yield);
    const ITag* array = driver_.tag("1?REG?40?unsignedByte-4");
    const auto count = [&](int index) {
        for (int round = 1; round <= 1000; ++round) {
            const auto wanted = static_cast<unsigned char>(round);
            unsigned char found = 0;
            EXPECT_NE(0, driver_.writeArrayItem(array, index, &wanted));
            EXPECT_NE(0, driver_.readArrayItem(array, index, &found));
            EXPECT_EQ(wanted, found);
        }
    };
    std::thread first(count, 1);
    std::thread second(count, 2);
    first.join();
    second.join();
}
