#include "sim/PtyLine.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <stdlib.h>
#include <unistd.h>

#include <array>
#include <filesystem>
#include <fstream>
#include <system_error>

#include "TestMaster.h"

namespace sim {
namespace {

using wire::Bytes;

namespace fs = std::filesystem;

class PtyLineTest : public testing::Test {
  protected:
    void SetUp() override {
        std::string pattern = testing::TempDir() + "ptyline-XXXXXX";
        ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
        room_ = pattern;
    }
    void TearDown() override { fs::remove_all(room_); }

    std::string linkPath() const { return (room_ / "port").string(); }

    fs::path room_;
};

/// Reads what a master has sent, until `count` bytes are there or the time is up.
Bytes readFrom(PtyLine& line, std::size_t count) {
    Bytes all;
    pollfd watched{.fd = line.descriptor(), .events = POLLIN, .revents = 0};
    while (all.size() < count && ::poll(&watched, 1, 10000) > 0) {
        const Bytes bytes = line.read();
        all.insert(all.end(), bytes.begin(), bytes.end());
    }
    return all;
}

/// Every byte that a terminal may take for a command.
Bytes allBytes() {
    Bytes bytes;
    for (int byte = 0; byte < 256; ++byte)
        bytes.push_back(static_cast<std::uint8_t>(byte));
    return bytes;
}

TEST_F(PtyLineTest, EveryByteValuePassesUnchangedBothWays) {
    PtyLine line;
    TestMaster master(line.path());
    ASSERT_TRUE(master.isOpen());
    line.write(allBytes());
    EXPECT_EQ(allBytes(), master.receive(256));
    master.send(allBytes());
    EXPECT_EQ(allBytes(), readFrom(line, 256));
}

TEST_F(PtyLineTest, ReadWithoutBytesReturnsAtOnce) {
    PtyLine line;
    EXPECT_TRUE(line.read().empty());
    EXPECT_GE(line.descriptor(), 0);
}

TEST_F(PtyLineTest, MastersComeAndGo) {
    PtyLine line;
    for (std::uint8_t round = 0; round < 5; ++round) {
        TestMaster master(line.path());
        ASSERT_TRUE(master.isOpen());
        master.send(Bytes{round});
        EXPECT_EQ(Bytes{round}, readFrom(line, 1));
    }
    EXPECT_TRUE(line.read().empty());
    EXPECT_GE(line.descriptor(), 0);
}

TEST_F(PtyLineTest, BytesThatNobodyReadsDoNotBlock) {
    PtyLine line;
    for (int i = 0; i < 100; ++i)
        line.write(Bytes(4096, 0x55));
    EXPECT_GE(line.descriptor(), 0);
}

TEST_F(PtyLineTest, HangUpIsSeenByTheMasterAndTheDeviceVanishes) {
    PtyLine line;
    const std::string device = line.device();
    TestMaster master(line.path());
    EXPECT_TRUE(fs::exists(device));
    line.hangUp();
    EXPECT_TRUE(master.seesHangUp());
    EXPECT_FALSE(fs::exists(device));
    EXPECT_EQ(-1, line.descriptor());
}

TEST_F(PtyLineTest, LinkLeadsToTheDeviceAndGoesWithTheLine) {
    {
        const PtyLine line(linkPath());
        EXPECT_EQ(linkPath(), line.path());
        EXPECT_EQ(line.device(), fs::read_symlink(linkPath()));
        EXPECT_TRUE(TestMaster(linkPath()).isOpen());
    }
    EXPECT_FALSE(fs::is_symlink(linkPath()));
}

/// Somebody's name for a real port would else lead to the simulator from then on.
TEST_F(PtyLineTest, ALinkThatItDidNotMakeIsRefusedAndKept) {
    fs::create_symlink("/nowhere", linkPath());
    EXPECT_THROW(PtyLine{linkPath()}, std::system_error);
    EXPECT_EQ("/nowhere", fs::read_symlink(linkPath()));
}

TEST_F(PtyLineTest, AFileInPlaceOfTheLinkIsRefusedAndKept) {
    std::ofstream(linkPath()) << "precious";
    EXPECT_THROW(PtyLine{linkPath()}, std::system_error);
    EXPECT_TRUE(fs::is_regular_file(linkPath()));
    EXPECT_EQ(8U, fs::file_size(linkPath()));
}

TEST_F(PtyLineTest, ALinkThatAnotherLineHasTakenIsLeftToIt) {
    PtyLine first(linkPath());
    fs::remove(linkPath());
    const PtyLine second(linkPath());
    first.hangUp();
    EXPECT_EQ(second.device(), fs::read_symlink(linkPath()));
}

}  // namespace
}  // namespace sim
