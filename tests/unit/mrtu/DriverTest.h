// The driver with fakes for everything that it stands on.
#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "mrtu/Protocol_MRTU.h"
#include "mrtu/Tag_MRTU.h"
#include "tests/support/FakeHost.h"
#include "tests/support/Replies.h"

namespace driver_test {

using testing_support::asciiFrame;
using testing_support::Bytes;
using testing_support::FakeHost;
using testing_support::hex;
using testing_support::rtuFrame;
using testing_support::ScriptedPort;
using testing_support::toHex;

/// Node 1, model "1", RTU at 9600 baud on "com1", in front of which stand the test's own items: the
/// first occurrence of an item counts.
inline std::string configText(const std::string& items = "") {
    return "CfgVer=1 " + items +
           " defNodeId=1 uart=com1 baudrate=9600 parity=none bits=8 stopbits=1 mode=RS-232";
}

/// A module that holds the services of `host` as long as it lives.
class BoundModule {
  public:
    explicit BoundModule(FakeHost& host);
    ~BoundModule();
    BoundModule(const BoundModule&) = delete;
    BoundModule& operator=(const BoundModule&) = delete;
};

class DriverTest : public ::testing::Test {
  protected:
    DriverTest();
    ~DriverTest() override;

    /// Configures; the test fails when that fails.
    void configure(const std::string& items = "");
    /// Configures and starts.
    void start(const std::string& items = "");
    /// A new driver object with the same host behind it, as after a restart of the panel.
    void restartDriver();

    /// A tag that the driver must accept; owned by the driver.
    const Tag_MRTU* tag(const std::string& uri);
    /// The driver must refuse the URI with this text in the tag's place of the message.
    void expectRefused(const std::string& uri, const std::string& text);

    void expectError(int code, const std::string& text) const;
    /// Makes the error state recognisable, so that a test can see that nothing set it.
    void plantError();
    void expectPlantedError() const;

    /// Reads `count` items at the tag's own address into a buffer of `size` bytes of 0xEE.
    bool read(const Tag_MRTU* tag, int count, int size = 256);
    /// The first `count` bytes of what read() delivered.
    Bytes got(std::size_t count) const { return testing_support::firstOf(buffer, count); }
    /// Writes `count` items at the tag's own address.
    int write(const Tag_MRTU* tag, const Bytes& data, int count);
    /// One byte or one 32-bit number into, and out of, one of the driver's own areas.
    int writeByte(const std::string& uri, int value);
    int writeNumber(const std::string& uri, std::int32_t value);
    int readByte(const std::string& uri);
    std::int32_t readNumber(const std::string& uri);

    std::string command(const std::string& line, int size = 4096);

    /// The requests that went out, in hexadecimal, one behind the other with ", " between.
    std::string sent() const;

    FakeHost host;
    ScriptedPort port{host.multiTask};
    BoundModule module{host};
    std::unique_ptr<Protocol_MRTU> driver;
    Bytes buffer;
};

}  // namespace driver_test
