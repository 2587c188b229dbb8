// A configuration that runs short of memory changes nothing.
#include <new>

#include "tests/support/MemoryShortage.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::configText;
using driver_test::DriverTest;
using testing_support::MemoryShortage;

class ConfigMemoryTest : public DriverTest {
  protected:
    std::string state() const {
        char text[80] = {};
        driver->vcsGetComParams(text, sizeof(text) - 1);
        const _MRTU::ParamManager& params = *driver->getParamManager();
        return std::string(text) + " " + std::to_string(params.getNodeParams(1)->timeout) + " " +
               params.getNodeParams(2)->prefix + " " + std::to_string(params.getMaxTm()) + " " +
               std::to_string(params.nodes().size()) + " " + params.getLastError();
    }

    /// Whether memory was long enough for `text` when `requests` were granted.
    bool configureWith(int requests, const std::string& text) {
        try {
            const MemoryShortage shortage(requests);
            return driver->Config(text.c_str()) != 0;
        } catch (const std::bad_alloc&) {
            return false;
        }
    }
};

TEST_F(ConfigMemoryTest, EveryShortageLeavesTheConfigurationBefore) {
    const std::string longName(80, 'p');
    configure("uart=com2 timeout=70 Node2::timeout=90 Node2::prefix=old" + longName);
    const Tag_MRTU* word = tag("2?HREG?400001?short");
    const std::string before = state();
    const std::string next =
        configText("uart=/dev/" + longName + " parity=EVEN timeout=5 Node2::prefix=new" + longName +
                   " Node1::timeout=8 Node3::timeout=9 mode=RS-485");
    int refused = 0;
    for (; !configureWith(refused, next); ++refused) {
        ASSERT_LT(refused, 1000);
        EXPECT_EQ(before, state()) << refused;
        EXPECT_EQ(90, word->nodeParams()->timeout) << refused;
    }
    EXPECT_GT(refused, 10);
    EXPECT_NE(before, state());
}

}  // namespace
