// A port that is pulled and put back while a line is polled.
#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>

#include "poll/BlockReader.h"
#include "runtime/MemoryStorage.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "runtime/ServiceFactory.h"
#include "sim/Simulator.h"

namespace {

// Of the driver; nobody waits that long.
constexpr std::chrono::seconds kTimeout{60};

class VanishedPortTest : public testing::Test {
  protected:
    VanishedPortTest() {
        simulator_.start();
        serial_.mapPort("com1", link_);
        EXPECT_TRUE(
            channel_.configure("CfgVer=1 uart=com1 baudrate=115200 parity=none stopbits=1 "
                               "mode=RS-232 txMode=RTU defNodeId=1 repeat=0 timeout=60000"));
        auto tag = channel_.createTag("1?HREG?400011?unsignedShort");
        source_ = std::make_unique<poll::ChannelSource>(
            channel_, std::vector<const ITag*>{tag.value()},
            poll::ChannelSource::Port{.gone = [this] { return serial_.portGone(); },
                                      .whyNotOpen = [this] { return serial_.lastError(); },
                                      .limitWait =
                                          [this](std::chrono::milliseconds wait) {
                                              serial_.limitWait(static_cast<int>(wait.count()));
                                          }});
        block_.items = 1;
        block_.tags = {0};
    }
    ~VanishedPortTest() override {
        source_.reset();
        simulator_.stop();
        std::filesystem::remove(link_);
    }

    bool readGood() { return source_->read(block_).front().good; }

    template <class Value, class Error>
    static Value need(runtime::Result<Value, Error> result) {
        if (!result) throw std::runtime_error(result.error().text);
        return std::move(result).value();
    }

    const std::string link_ = testing::TempDir() + "vanished-port-" + std::to_string(::getpid());
    sim::Simulator simulator_{[this] {
        sim::SimulatorOptions options;
        options.link = link_;
        return options;
    }()};
    runtime::PosixMultiTask multiTask_;
    runtime::PosixSerialFactory serial_;
    runtime::MemoryStorage storage_;
    runtime::ServiceFactory services_{multiTask_, serial_, &storage_};
    runtime::PluginLibrary library_ = need(runtime::PluginLibrary::load(PLUGIN_FILE));
    runtime::Module module_ = need(runtime::Module::bind(library_, services_));
    runtime::Channel channel_{need(module_.createProtocol("MRTU"))};
    std::unique_ptr<poll::ChannelSource> source_;
    poll::Block block_;
};

TEST_F(VanishedPortTest, PulledPortIsNoticedAndWorksAgainWhenItIsBack) {
    ASSERT_TRUE(source_->open()) << source_->fault();
    EXPECT_TRUE(readGood());
    EXPECT_FALSE(source_->gone());

    simulator_.stop();
    EXPECT_FALSE(readGood());
    EXPECT_TRUE(source_->gone());
    source_->close();
    EXPECT_EQ(0, serial_.openPorts()) << "its name can come back";
    EXPECT_FALSE(source_->gone()) << "a closed line has no port to lose";

    EXPECT_FALSE(source_->open());
    EXPECT_EQ("com1: " + link_ + ": No such file or directory", source_->fault());

    simulator_.start();
    ASSERT_TRUE(source_->open()) << source_->fault();
    EXPECT_FALSE(source_->gone());
    EXPECT_TRUE(readGood());
    EXPECT_EQ("", source_->fault());
}

TEST_F(VanishedPortTest, PulledPortIsNoticedEveryTime) {
    for (int time = 0; time < 3; ++time) {
        ASSERT_TRUE(source_->open()) << source_->fault();
        EXPECT_TRUE(readGood());
        simulator_.stop();
        EXPECT_FALSE(readGood());
        EXPECT_TRUE(source_->gone());
        source_->close();
        simulator_.start();
    }
}

TEST_F(VanishedPortTest, SilentNodeIsNoVanishedPortAndAProbeOfItTakesItsOwnWait) {
    ASSERT_TRUE(source_->open());
    simulator_.slave().setPresence(1, sim::kDead);
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_EQ(-4, source_->probe(block_, std::chrono::milliseconds{5}).front().error.code);
    EXPECT_GT(kTimeout, std::chrono::steady_clock::now() - begin);
    EXPECT_FALSE(source_->gone());
}

}  // namespace
