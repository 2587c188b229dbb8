// Sixteen threads of an application on one line: reads, writes, the driver's own areas, the
// console, Start and Stop. Most of what this finds is found by the thread sanitizer.
#include <atomic>
#include <functional>
#include <latch>
#include <string>
#include <thread>
#include <vector>

#include "tests/line/DriverLine.h"

namespace {

constexpr int kRounds = 12;
constexpr int kRestarts = 6;

class DriverThreadsTest : public testing::Test {
  protected:
    DriverThreadsTest() {
        for (unsigned number = 0; number < 20; ++number)
            line_.simulator.slave().set(1, sim::Area::HoldingRegister, number, 1000 + number);
    }

    void repeat(const std::function<void(int)>& work) {
        threads_.emplace_back([this, work] {
            go_.wait();
            for (int round = 0; round < kRounds || restarts_ < kRestarts; ++round) {
                work(round);
                std::this_thread::yield();
            }
        });
    }
    void runThemAll() {
        EXPECT_EQ(16U, threads_.size());
        go_.count_down();
        for (std::thread& thread : threads_)
            thread.join();
    }

    /// @return whether it was read.
    bool readWord(const ITag* tag, int expected) {
        unsigned char value[2] = {};
        if (line_.driver().Read(tag, value) == 0) return false;
        if (value[0] + value[1] * 256 != expected) ++wrong_;
        return true;
    }
    void write(const ITag* tag, int value) {
        const auto number = static_cast<unsigned>(value);
        const unsigned char bytes[4] = {static_cast<unsigned char>(number & 255),
                                        static_cast<unsigned char>(number >> 8 & 255),
                                        static_cast<unsigned char>(number >> 16 & 255), 0};
        static_cast<void>(line_.driver().Write(tag, bytes));
    }
    void command(const std::string& command) {
        char answer[256] = {};
        if (line_.driver().DoCommand(command.c_str(), answer, sizeof answer) != 1) ++wrong_;
    }
    void restart() {
        if (line_.driver().Stop() == 0) ++wrong_;
        if (line_.driver().Start() == 0) ++wrong_;
        ++restarts_;
    }

    DriverLine line_{"timeout=40 repeat=1"};
    std::atomic<int> wrong_ = 0;
    std::atomic<int> answered_ = 0;
    std::atomic<int> restarts_ = 0;

  private:
    std::vector<std::thread> threads_;
    std::latch go_{1};
};

TEST_F(DriverThreadsTest, ReadsWritesAreasConsoleStartAndStop) {
    const ITag* word = line_.tag("1?HREG?400001?short");
    const ITag* otherWord = line_.tag("1?HREG?400006?short");
    const ITag* silent = line_.tag("2?HREG?400001?short");
    const ITag* noBcd = line_.tag("1?HREG?400011?short(bcd)");
    const ITag* written = line_.tag("1?HREG?400101?short");
    const ITag* block = line_.tag("1?HREG?400101?short-20");
    const ITag* bit = line_.tag("1?HREG?400103.3?boolean");
    const ITag* otherBit = line_.tag("1?HREG?400103.4?boolean");
    const ITag* nodeOverride = line_.tag("5?NO?0?unsignedByte");
    const ITag* modicon = line_.tag("5?NP_Mode?0?boolean");
    const ITag* baud = line_.tag("1?SP_Baud?0?unsignedInt");
    const ITag* apply = line_.tag("1?SP_Done?0?boolean");

    for (const ITag* tag : {word, word, word})
        repeat([=, this](int) { answered_ += readWord(tag, 1000) ? 1 : 0; });
    repeat([=, this](int) { answered_ += readWord(otherWord, 1005) ? 1 : 0; });
    for (int twice = 0; twice < 2; ++twice)
        repeat([=, this](int) {
            if (readWord(noBcd, 0)) ++wrong_;
        });
    repeat([=, this](int) {
        if (readWord(silent, 0)) ++wrong_;
    });
    repeat([=, this](int round) { write(written, round); });
    repeat([=, this](int) {
        const unsigned char values[40] = {};
        static_cast<void>(line_.driver().Write(block, values));
    });
    repeat([=, this](int round) { write(bit, round % 2); });
    repeat([=, this](int round) { write(otherBit, round % 2); });
    repeat([=, this](int round) {
        write(nodeOverride, 5 + round % 3);
        write(modicon, round % 2);
    });
    repeat([=, this](int round) {
        write(baud, round % 2 == 0 ? 57600 : 115200);
        write(apply, 1);
    });
    repeat([=, this](int round) {
        command("setid 6 " + std::to_string(round % 9));
        command("getid");
        command("lasterror");
    });
    for (int twice = 0; twice < 2; ++twice)
        repeat([this](int) { restart(); });
    runThemAll();

    EXPECT_EQ(0, wrong_) << line_.lastError();
    EXPECT_LT(0, answered_);
    EXPECT_NE(0, line_.driver().Start());
    EXPECT_TRUE(readWord(word, 1000)) << line_.lastError();
}

}  // namespace
