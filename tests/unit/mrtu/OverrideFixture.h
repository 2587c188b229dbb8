// A driver whose node addresses and address modes change while it runs.
#pragma once

#include <string>

#include "tests/unit/mrtu/DriverTest.h"

namespace driver_test {

inline constexpr const char* kNode = "1?NO?0?unsignedByte";
inline constexpr const char* kWord = "1?HREG?400011?short";

class OverrideFixture : public DriverTest {
  protected:
    /// Node and address of the request that a read of one register at `index` sends.
    std::string lineHead(const std::string& uri, int index = 10) {
        port.forget();
        port.silence();
        unsigned char data[2];
        EXPECT_FALSE(driver->doReadBlock(tag(uri), index, data, 1));
        return port.sent().empty() ? "" : toHex(testing_support::firstOf(port.sent()[0], 4));
    }
    std::string writtenHead(const std::string& uri, int index = 10) {
        port.forget();
        port.silence();
        const unsigned char data[] = {0, 0};
        EXPECT_EQ(0, driver->doWrite(tag(uri), index, data, 1));
        return port.sent().empty() ? "" : toHex(testing_support::firstOf(port.sent()[0], 4));
    }
};

}  // namespace driver_test
