// Two threads of an application on one register, the whole way: plug-in, pseudo terminal, slave.
#include <atomic>
#include <thread>

#include "tests/line/DriverLine.h"

namespace {

constexpr int kRounds = 150;

TEST(BitRaceTest, FlippingBitsOfOneRegisterLosesNoUpdateOnALine) {
    DriverLine line;
    line.simulator.slave().set(1, sim::Area::HoldingRegister, 9, 0);

    std::atomic<int> lost = 0;
    const auto flip = [&line, &lost](const ITag* bit) {
        IProtocol& driver = line.driver();
        for (int round = 0; round < kRounds; ++round) {
            const unsigned char wanted = round % 2 == 0 ? 1 : 0;
            unsigned char found = 2;
            if (driver.Write(bit, &wanted) == 0 || driver.Read(bit, &found) == 0) ++lost;
            if (found != wanted) ++lost;
        }
    };
    const ITag* low = line.tag("1?HREG?400010.0?boolean");
    const ITag* high = line.tag("1?HREG?400010.15?boolean");
    std::thread first(flip, low);
    std::thread second(flip, high);
    first.join();
    second.join();
    EXPECT_EQ(0, lost) << line.lastError();
    EXPECT_EQ(0U, line.simulator.slave().get(1, sim::Area::HoldingRegister, 9));
}

}  // namespace
