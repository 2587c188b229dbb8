// Everything that may come at the same time, at the same time. Most of what this finds is found by
// the thread sanitizer.
#include <atomic>
#include <functional>
#include <latch>
#include <map>
#include <random>
#include <set>
#include <sstream>
#include <thread>
#include <vector>

#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::rtuFrame;
using testing_support::rtuMessage;

constexpr int kRounds = 400;
constexpr int kRestarts = 10;

/// Failures that the threads provoke; the text and its code belong together.
const std::map<std::string, int> kFailures = {
    {"", 1},
    {"Protocol not started", -3},
    {"No response", -4},
    {"Exception: Illegal data address", -6},
    {"Incorrect response checksum", -6},
    {"read conversion error", -9},
    {"Node disabled", -10},
};

/// Register n holds n; registers from 30000 on do not exist, from 40000 on the slave is silent and
/// from 50000 on its answers are damaged.
Bytes answer(const Bytes& frame) {
    const Bytes message = rtuMessage(frame);
    const auto address = static_cast<std::uint16_t>(message[2] * 256 + message[3]);
    const auto count = static_cast<std::uint16_t>(message[4] * 256 + message[5]);
    const std::uint8_t node = message[0];
    const std::uint8_t function = message[1];
    if (address >= 50000) return {node, function, 0, 0, 0, 0};
    if (address >= 40000) return {};
    if (address >= 30000) return rtuFrame(testing_support::exceptionReply(node, function, 2));
    if (function == 1) return rtuFrame(testing_support::bitsReply(node, function, {true}));
    if (function >= 5) return rtuFrame(testing_support::writeReply(node, function, address, count));
    std::vector<std::uint16_t> values;
    for (std::uint16_t item = 0; item < count; ++item)
        values.push_back(static_cast<std::uint16_t>(address + item));
    return rtuFrame(testing_support::registersReply(node, function, values));
}

class ThreadsTogetherTest : public DriverTest {
  protected:
    ThreadsTogetherTest() { port.answerWith(answer); }

    /// A thread that does the work again and again.
    void repeat(const std::function<void(int)>& work) {
        threads_.emplace_back([this, work] {
            go_.wait();
            for (int round = 0; round < kRounds || restarts_ < kRestarts; ++round) {
                work(round);
                // The lock is not a fair one, and a Stop() shall have its turn.
                std::this_thread::yield();
            }
        });
    }
    /// A thread that starts and stops at moments of its own until the others are done.
    void startAndStop(unsigned seed) {
        meanwhile_.emplace_back([this, seed] {
            std::minstd_rand random(seed);
            go_.wait();
            while (!done_) {
                for (auto turns = random() % 50; turns > 0; --turns)
                    std::this_thread::yield();
                check(driver->Stop() != 0);
                check(driver->Start() != 0);
                ++restarts_;
            }
        });
    }
    void runThemAll() {
        EXPECT_EQ(16U, threads_.size() + meanwhile_.size());
        go_.count_down();
        for (std::thread& thread : threads_)
            thread.join();
        done_ = true;
        for (std::thread& thread : meanwhile_)
            thread.join();
        EXPECT_EQ(0, wrong_) << driver->GetLastErrorString();
    }

    void check(bool right) {
        if (!right) ++wrong_;
    }

    /// A register may be read or the driver may be stopped; there is no third.
    void readWord(const Tag_MRTU* tag, int expected) {
        unsigned char value[2] = {};
        if (driver->Read(tag, value) == 0) return;
        ++answered_;
        check(value[0] + value[1] * 256 == expected);
    }
    void readInVain(const Tag_MRTU* tag) {
        unsigned char value[2] = {0xEE, 0xEE};
        check(driver->Read(tag, value) == 0 && value[0] == 0xEE && value[1] == 0xEE);
    }
    void writeArea(const Tag_MRTU* tag, int value) {
        unsigned char bytes[4] = {};
        for (unsigned byte = 0; byte < 4; ++byte)
            bytes[byte] =
                static_cast<unsigned char>((static_cast<unsigned>(value) >> 8 * byte) & 255);
        static_cast<void>(driver->Write(tag, bytes));
    }
    void readArea(const Tag_MRTU* tag, const std::set<int>& allowed) {
        unsigned char bytes[4] = {};
        if (driver->Read(tag, bytes) == 0) return;
        check(allowed.contains(bytes[0] + bytes[1] * 256 + bytes[2] * 65536));
    }
    void lookAtTheError() {
        const std::string text = driver->GetLastErrorString();
        check(kFailures.contains(text));
        const int code = driver->GetLastError();
        check(code == 1 || (code <= -3 && code >= -10));
    }

    std::atomic<int> wrong_ = 0;
    std::atomic<int> answered_ = 0;
    std::atomic<int> restarts_ = 0;

  private:
    std::vector<std::thread> threads_;
    std::vector<std::thread> meanwhile_;
    std::latch go_{1};
    std::atomic<bool> done_ = false;
};

TEST_F(ThreadsTogetherTest, ReadsWritesAreasConsoleStartAndStop) {
    start("repeat=0 timeout=20 Node7::defNodeId=7 Node7::model=1 Node7::delay=1");
    const Tag_MRTU* word = tag("1?HREG?400101?short");
    const Tag_MRTU* otherWord = tag("7?HREG?400102?short");
    const Tag_MRTU* inputs = tag("3?IREG?300201?short");
    const Tag_MRTU* coil = tag("1?OUTP?5?boolean");
    const Tag_MRTU* noBcd = tag("1?HREG?400016?short(bcd)");
    const Tag_MRTU* noAddress = tag("1?HREG?430002?short");
    const Tag_MRTU* silent = tag("1?HREG?440002?short");
    const Tag_MRTU* damaged = tag("1?HREG?450002?short");
    const Tag_MRTU* bit = tag("1?HREG?400101.3?boolean");
    const Tag_MRTU* otherBit = tag("1?HREG?400101.4?boolean");
    const Tag_MRTU* override5 = tag("5?NO?0?unsignedByte");
    const Tag_MRTU* override6 = tag("6?NO?0?unsignedByte");
    const Tag_MRTU* modicon = tag("5?NP_Mode?0?boolean");
    const Tag_MRTU* baud = tag("1?SP_Baud?0?unsignedInt");
    const Tag_MRTU* parity = tag("1?SP_Par?0?unsignedByte");
    const Tag_MRTU* apply = tag("1?SP_Done?0?boolean");

    repeat([=, this](int) { readWord(word, 100); });
    repeat([=, this](int) { readWord(otherWord, 101); });
    repeat([=, this](int) { readWord(inputs, 200); });
    for (int twice = 0; twice < 2; ++twice)
        repeat([=, this](int round) {
            readInVain(round % 2 == 0 ? noBcd : noAddress);
            const std::string text = noBcd->getError();
            check(text.empty() || text == "Conversion error at: bcd");
        });
    repeat([=, this](int round) { readInVain(round % 2 == 0 ? silent : damaged); });
    repeat([=, this](int round) { writeArea(round % 2 == 0 ? word : otherWord, round); });
    repeat([=, this](int round) { writeArea(bit, round % 2); });
    repeat([=, this](int round) { writeArea(round % 2 == 0 ? otherBit : coil, round % 2); });
    repeat([=, this](int round) {
        writeArea(round % 2 == 0 ? override5 : override6, 5 + round % 3);
        readArea(override5, {5, 6, 7, 9});
    });
    repeat([=, this](int round) {
        writeArea(modicon, round % 2);
        readArea(modicon, {0, 1});
        command("setid 6 " + std::to_string(5 + round % 3));
    });
    repeat([=, this](int round) {
        writeArea(baud, round % 2 == 0 ? 19200 : 9600);
        writeArea(parity, round % 3);
        readArea(baud, {9600, 19200, 38400});
        writeArea(apply, 1);
    });
    repeat([=, this](int round) {
        writeArea(baud, round % 2 == 0 ? 38400 : 9600);
        writeArea(apply, 1);
        lookAtTheError();
    });
    repeat([=, this](int) {
        char report[64] = {};
        driver->vcsGetComParams(report, sizeof report);
        check(std::string(report).starts_with("com1,"));
        check(command("getid").ends_with('\n'));
        lookAtTheError();
    });
    for (const unsigned seed : {1U, 2U})
        startAndStop(seed);
    runThemAll();
    EXPECT_LT(0, answered_);
    EXPECT_LE(kRestarts / 2U, host.serialFactory.opened().size());
}

/// Whoever came last, port, report and storage agree in the end.
TEST_F(ThreadsTogetherTest, SettingsAgreeInTheEnd) {
    start("repeat=0");
    const Tag_MRTU* baud = tag("1?SP_Baud?0?unsignedInt");
    const Tag_MRTU* apply = tag("1?SP_Done?0?boolean");
    const Tag_MRTU* override5 = tag("5?NO?0?unsignedByte");
    const Tag_MRTU* modicon = tag("5?NP_Mode?0?boolean");
    for (const int rate : {1200, 2400, 4800, 9600})
        repeat([=, this](int) {
            writeArea(baud, rate);
            writeArea(apply, 1);
        });
    for (int node = 6; node < 12; ++node)
        repeat([=, this](int) { writeArea(override5, node); });
    for (int node = 12; node < 14; ++node)
        repeat([=, this](int) { command("setid 5 " + std::to_string(node)); });
    for (int on = 0; on < 2; ++on)
        repeat([=, this](int) { writeArea(modicon, on); });
    for (const unsigned seed : {1U, 2U})
        startAndStop(seed);
    runThemAll();

    driver->Start();
    char report[64] = {};
    driver->vcsGetComParams(report, sizeof report);
    const int applied = port.settings().back().baud;
    EXPECT_EQ("com1," + std::to_string(applied) + ",none,8,1,RS-232", report);
    EXPECT_EQ("int:" + std::to_string(applied), host.stored.describe("MRTU", "baud"));
    EXPECT_EQ("text:" + std::to_string(readByte("5?NO?0?unsignedByte")),
              host.stored.describe("MRTU", "tempNode5"));
    EXPECT_EQ(readByte("5?NP_Mode?0?boolean") != 0 ? "bool:true" : "bool:false",
              host.stored.describe("MRTU", "node5_ModiconMode"));
}

}  // namespace
