// Two threads of an application on one register, the whole way: plug-in, pseudo terminal, slave.
#include <gtest/gtest.h>

#include <atomic>
#include <thread>

#include "runtime/Channel.h"
#include "runtime/HostServices.h"
#include "runtime/Module.h"
#include "runtime/PluginLibrary.h"
#include "runtime/PosixMultiTask.h"
#include "runtime/PosixSerialFactory.h"
#include "sim/Simulator.h"

namespace {

constexpr int kRounds = 150;

TEST(BitRaceTest, FlippingBitsOfOneRegisterLosesNoUpdateOnALine) {
    sim::Simulator simulator({.nodes = {{.address = 1}}});
    simulator.start();
    simulator.slave().set(1, sim::Area::holdingRegister, 9, 0);

    runtime::PosixMultiTask multiTask;
    runtime::PosixSerialFactory serial;
    serial.mapPort("com1", simulator.path());
    runtime::HostServices services(multiTask, serial);
    auto library = runtime::PluginLibrary::load(PLUGIN_FILE);
    ASSERT_TRUE(library.ok()) << library.error().text;
    auto module = runtime::Module::bind(library.value(), services);
    ASSERT_TRUE(module.ok()) << module.error().text;
    auto protocol = module.value().createProtocol("MRTU");
    ASSERT_TRUE(protocol.ok()) << protocol.error().text;
    runtime::Channel channel(std::move(protocol).value());
    ASSERT_TRUE(channel
                    .configure("CfgVer=1 txMode=RTU uart=com1 baudrate=115200 parity=none "
                               "stopbits=1 mode=RS-232 defNodeId=1 timeout=20000")
                    .ok());
    ASSERT_TRUE(channel.start().ok());

    std::atomic<int> lost = 0;
    const auto flip = [&channel, &lost](const ITag* bit) {
        IProtocol& driver = channel.protocol();
        for (int round = 0; round < kRounds; ++round) {
            const unsigned char wanted = round % 2 == 0 ? 1 : 0;
            unsigned char found = 2;
            if (driver.Write(bit, &wanted) == 0 || driver.Read(bit, &found) == 0) ++lost;
            if (found != wanted) ++lost;
        }
    };
    const ITag* low = channel.createTag("1?HREG?400010.0?boolean").value();
    const ITag* high = channel.createTag("1?HREG?400010.15?boolean").value();
    std::thread first(flip, low);
    std::thread second(flip, high);
    first.join();
    second.join();
    EXPECT_EQ(lost, 0) << channel.lastError().text;
    EXPECT_EQ(simulator.slave().get(1, sim::Area::holdingRegister, 9), 0U);
}

}  // namespace
