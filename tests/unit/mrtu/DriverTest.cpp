#include "tests/unit/mrtu/DriverTest.h"

#include <cstring>

#include "platform/IProtModule.h"
#include "plugin/ProtFactory.h"

namespace driver_test {

namespace {

IProtModule* module() {
    return static_cast<IProtModule*>(
        GetInterfaceFactory()->CreateInterface("IProtModule")->ConvertTo("IProtModule"));
}

constexpr int kPlantedCode = -1;

}  // namespace

BoundModule::BoundModule(FakeHost& host) {
    if (module()->Init(&host) == 0) ADD_FAILURE() << module()->GetLastError();
}

BoundModule::~BoundModule() {
    module()->Close();
}

DriverTest::DriverTest() {
    host.serialFactory.offer("com1", port);
    driver = std::make_unique<Protocol_MRTU>();
}

DriverTest::~DriverTest() {
    EXPECT_FALSE(host.multiTask.anyLockHeld()) << "the transaction lock was left taken";
    EXPECT_EQ(0, port.purges()) << "the driver flushes byte by byte";
}

void DriverTest::configure(const std::string& items) {
    ASSERT_NE(0, driver->Config(configText(items).c_str())) << driver->GetLastErrorString();
}

void DriverTest::start(const std::string& items) {
    configure(items);
    ASSERT_NE(0, driver->Start()) << driver->GetLastErrorString();
}

void DriverTest::restartDriver() {
    driver.reset();
    driver = std::make_unique<Protocol_MRTU>();
}

const Tag_MRTU* DriverTest::tag(const std::string& uri) {
    const ITag* made = driver->CreateTag(uri.c_str());
    if (made == nullptr) {
        ADD_FAILURE() << uri << ": " << driver->GetLastErrorString();
        std::abort();
    }
    return static_cast<const Tag_MRTU*>(made);
}

void DriverTest::expectRefused(const std::string& uri, const std::string& text) {
    plantError();
    EXPECT_EQ(nullptr, driver->CreateTag(uri.c_str())) << uri;
    EXPECT_EQ("Tag URI error: " + uri + " - " + text, driver->GetLastErrorString());
    EXPECT_EQ(-1, driver->GetLastError()) << uri;
}

void DriverTest::expectError(int code, const std::string& text) const {
    EXPECT_EQ(code, driver->GetLastError());
    EXPECT_EQ(text, driver->GetLastErrorString());
}

void DriverTest::plantError() {
    EXPECT_EQ(nullptr, driver->createAlarm("x"));
}

void DriverTest::expectPlantedError() const {
    expectError(kPlantedCode, "protocol does not support alarms");
}

bool DriverTest::read(const Tag_MRTU* tag, int count, int size) {
    buffer.assign(static_cast<std::size_t>(size), 0xEE);
    return driver->doReadBlock(tag, tag->offset(), buffer.data(), count);
}

int DriverTest::write(const Tag_MRTU* tag, const Bytes& data, int count) {
    return driver->doWrite(tag, tag->offset(), data.data(), count);
}

int DriverTest::writeByte(const std::string& uri, int value) {
    const auto byte = static_cast<unsigned char>(value);
    return driver->doWrite(tag(uri), 0, &byte, 1);
}

int DriverTest::writeNumber(const std::string& uri, std::int32_t value) {
    unsigned char bytes[sizeof value];
    std::memcpy(bytes, &value, sizeof value);
    return driver->doWrite(tag(uri), 0, bytes, 1);
}

int DriverTest::readByte(const std::string& uri) {
    unsigned char bytes[] = {0xEE, 0xEE};
    EXPECT_TRUE(driver->doReadBlock(tag(uri), 0, bytes, 1)) << uri;
    EXPECT_EQ(0xEE, bytes[1]) << uri << " stored more than one byte";
    return bytes[0];
}

std::int32_t DriverTest::readNumber(const std::string& uri) {
    std::int32_t value = -1;
    unsigned char bytes[sizeof value + 1] = {0xEE, 0xEE, 0xEE, 0xEE, 0xEE};
    EXPECT_TRUE(driver->doReadBlock(tag(uri), 0, bytes, 1)) << uri;
    EXPECT_EQ(0xEE, bytes[4]) << uri << " stored more than four bytes";
    std::memcpy(&value, bytes, sizeof value);
    return value;
}

std::string DriverTest::command(const std::string& line, int size) {
    std::string answer(static_cast<std::size_t>(size), '\0');
    EXPECT_EQ(1, driver->DoCommand(line.c_str(), answer.data(), size)) << line;
    return answer.substr(0, answer.find('\0'));
}

std::string DriverTest::sent() const {
    std::string text;
    for (const Bytes& request : port.sent())
        text += (text.empty() ? "" : ", ") + toHex(request);
    return text;
}

}  // namespace driver_test
