// What one request costs of the heap: nothing.
#include <gtest/gtest.h>

#include "tests/support/AllocationCounter.h"
#include "tests/support/FixedReplyPort.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::asciiFrame;
using driver_test::Bytes;
using driver_test::hex;
using driver_test::rtuFrame;
using testing_support::AllocationCounter;
using testing_support::FixedReplyPort;
using testing_support::operator+;

class DriverAllocationTest : public ::testing::Test {
  protected:
    void start(const std::string& items) {
        host.serialFactory.offer("com1", port);
        ASSERT_NE(0, driver.Config(driver_test::configText(items).c_str()));
        ASSERT_NE(0, driver.Start());
    }
    const Tag_MRTU* tag(const char* uri) {
        return static_cast<const Tag_MRTU*>(driver.CreateTag(uri));
    }

    /// Heap blocks that one call takes after the first one.
    template <class Call>
    std::size_t costOf(Call call) {
        EXPECT_TRUE(call()) << driver.GetLastErrorString();
        const AllocationCounter counter;
        const bool done = call();
        const std::size_t cost = counter.allocations() + counter.releases();
        EXPECT_TRUE(done) << driver.GetLastErrorString();
        return cost;
    }
    std::size_t costOfRead(const Tag_MRTU* tag, int count) {
        return costOf([this, tag, count] {
            return driver.doReadBlock(tag, tag->offset(), data.data(), count);
        });
    }
    std::size_t costOfWrite(const Tag_MRTU* tag, int count) {
        return costOf([this, tag, count] {
            return driver.doWrite(tag, tag->offset(), data.data(), count) != 0;
        });
    }

    testing_support::FakeHost host;
    FixedReplyPort port{{}};
    driver_test::BoundModule module{host};
    Protocol_MRTU driver;
    Bytes data = Bytes(512, 0);
};

TEST_F(DriverAllocationTest, TheCounterCounts) {
    const AllocationCounter counter;
    const std::string text(100, 'x');
    EXPECT_EQ(1U, counter.allocations());
    EXPECT_EQ(100U, text.size());
}

TEST_F(DriverAllocationTest, ReadOfAFullBlock) {
    start("");
    port.setReply(rtuFrame(hex("01 03 FA") + Bytes(250, 1)));
    EXPECT_EQ(0U, costOfRead(tag("1?HREG?400001?short"), 125));
}

TEST_F(DriverAllocationTest, ReadOfAFullBlockInAscii) {
    start("txMode=ASCII");
    port.setReply(asciiFrame(hex("01 03 FA") + Bytes(250, 1)));
    EXPECT_EQ(0U, costOfRead(tag("1?HREG?400001?short"), 125));
}

TEST_F(DriverAllocationTest, ReadOfCoils) {
    start("");
    port.setReply(rtuFrame(hex("01 01 FA") + Bytes(250, 1)));
    EXPECT_EQ(0U, costOfRead(tag("1?OUTP?4?boolean"), 2000));
}

TEST_F(DriverAllocationTest, ReadOfAnOverriddenNode) {
    start("");
    char answer[64];
    driver.DoCommand("setid 1 9", answer, sizeof answer);
    port.setReply(rtuFrame(hex("09 03 02 12 34")));
    EXPECT_EQ(0U, costOfRead(tag("1?HREG?400001?short"), 1));
}

TEST_F(DriverAllocationTest, WriteOfRegisters) {
    start("");
    port.setReply(rtuFrame(hex("01 10 00 00 00 7B")));
    EXPECT_EQ(0U, costOfWrite(tag("1?HREG?400001?short"), 123));
}

TEST_F(DriverAllocationTest, WriteOfRegistersInAscii) {
    start("txMode=ASCII");
    port.setReply(asciiFrame(hex("01 10 00 00 00 7B")));
    EXPECT_EQ(0U, costOfWrite(tag("1?HREG?400001?short"), 123));
}

TEST_F(DriverAllocationTest, WriteOfCoils) {
    start("");
    port.setReply(rtuFrame(hex("01 0F 00 00 07 B0")));
    EXPECT_EQ(0U, costOfWrite(tag("1?OUTP?1?boolean"), 1968));
}

TEST_F(DriverAllocationTest, WriteOfSingleItems) {
    start("presetFunction=06 forceFunction=05");
    port.setReply(rtuFrame(hex("01 06 00 00 00 00")));
    EXPECT_EQ(0U, costOfWrite(tag("1?HREG?400001?short"), 1));
    port.setReply(rtuFrame(hex("01 05 00 00 00 00")));
    EXPECT_EQ(0U, costOfWrite(tag("1?OUTP?1?boolean"), 1));
}

TEST_F(DriverAllocationTest, FirstRequestOfASecondTag) {
    start("");
    port.setReply(rtuFrame(hex("01 03 02 12 34")));
    ASSERT_EQ(0U, costOfRead(tag("1?HREG?400001?short"), 1));
    const Tag_MRTU* second = tag("1?HREG?400002?short");
    const AllocationCounter counter;
    EXPECT_TRUE(driver.doReadBlock(second, second->offset(), data.data(), 1));
    EXPECT_EQ(0U, counter.allocations() + counter.releases());
}

TEST_F(DriverAllocationTest, FailedRequest) {
    start("repeat=0");
    port.setReply(rtuFrame(hex("01 83 02")));
    const Tag_MRTU* word = tag("1?HREG?400001?short");
    EXPECT_FALSE(driver.doReadBlock(word, word->offset(), data.data(), 1));
    const AllocationCounter counter;
    EXPECT_FALSE(driver.doReadBlock(word, word->offset(), data.data(), 1));
    EXPECT_EQ(0U, counter.allocations() + counter.releases());
    EXPECT_STREQ("Exception: Illegal data address", driver.GetLastErrorString());
}

/// The key of a node's Modicon mode is longer than what a string holds without the heap.
TEST_F(DriverAllocationTest, SecondRequestOfANodeWithALongNumber) {
    start("");
    port.setReply(rtuFrame(hex("01 03 02 12 34")));
    EXPECT_EQ(0U, costOfRead(tag("1000000001?HREG?400001?short"), 1)) << "low byte 1";
}

// Above the requests: the values of large tags take one or two buffers, given back at once.
TEST_F(DriverAllocationTest, WholeTagsTakeBuffersByTheirSize) {
    struct Row {
        const char* uri;
        Bytes read;     // the reply without its check
        Bytes written;  // the same of a write
        std::size_t costOfRead;
        std::size_t costOfWrite;
    };
    const Row rows[] = {
        {"1?HREG?400001?short", hex("01 03 02 00 01"), hex("01 10 00 00 00 01"), 0, 0},
        {"1?HREG?400001?short-32", hex("01 03 40") + Bytes(64, 1), hex("01 10 00 00 00 20"), 0, 0},
        {"1?HREG?400001?short-33", hex("01 03 42") + Bytes(66, 1), hex("01 10 00 00 00 21"), 1, 0},
        {"1?HREG?400001?short-123", hex("01 03 F6") + Bytes(246, 1), hex("01 10 00 00 00 7B"), 1,
         0},
        {"1?OUTP?1?boolean-1968", hex("01 01 F6") + Bytes(246, 1), hex("01 0F 00 00 07 B0"), 2, 1},
    };
    start("");
    Bytes value(2000, 1);
    for (const Row& row : rows) {
        const Tag_MRTU* const whole = tag(row.uri);
        port.setReply(rtuFrame(row.read));
        // Each is given back: twice as many calls.
        EXPECT_EQ(2 * row.costOfRead, costOf([&] { return driver.Read(whole, value.data()) != 0; }))
            << row.uri;
        port.setReply(rtuFrame(row.written));
        EXPECT_EQ(2 * row.costOfWrite,
                  costOf([&] { return driver.Write(whole, value.data()) != 0; }))
            << row.uri;
    }
}

TEST_F(DriverAllocationTest, TheLargestReadsTakeOneBufferOfRegistersAndTwoOfCoils) {
    start("");
    Bytes value(2000, 1);
    const auto cost = [&](const char* uri) {
        const Tag_MRTU* const whole = tag(uri);
        return costOf([&] { return driver.Read(whole, value.data()) != 0; });
    };
    port.setReply(rtuFrame(hex("01 03 FA") + Bytes(250, 1)));
    EXPECT_EQ(2U * 1, cost("1?HREG?400001?short-125"));
    port.setReply(rtuFrame(hex("01 01 FA") + Bytes(250, 1)));
    EXPECT_EQ(2U * 2, cost("1?OUTP?1?boolean-2000"));
}

}  // namespace
