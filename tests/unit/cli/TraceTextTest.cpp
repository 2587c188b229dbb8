#include "cli/TraceText.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>

namespace {

using cli::Bytes;

class TraceText : public testing::Test {
  protected:
    void SetUp() override {
        setenv("TZ", "UTC", 1);
        tzset();
    }
    /// 2001-09-09 01:46:40 UTC and 7 ms.
    std::chrono::system_clock::time_point at_{std::chrono::milliseconds(1'000'000'000'007)};
    std::string port_ = "com1";
};

TEST_F(TraceText, ShowsTimePortDirectionAndBytes) {
    const Bytes bytes{0x01, 0x0A, 0xFF};
    EXPECT_EQ(cli::traceText({runtime::TraceDirection::Sent, port_, {}, at_, bytes, true}),
              "01:46:40.007 com1 > 01 0A FF");
    EXPECT_EQ(cli::traceText({runtime::TraceDirection::Received, port_, {}, at_, bytes, true}),
              "01:46:40.007 com1 < 01 0A FF");
}

TEST_F(TraceText, TellsThatAFrameWasCutShort) {
    const Bytes bytes{0x01};
    EXPECT_EQ(cli::traceText({runtime::TraceDirection::Received, port_, {}, at_, bytes, false}),
              "01:46:40.007 com1 < 01 (cut)");
}

}  // namespace
