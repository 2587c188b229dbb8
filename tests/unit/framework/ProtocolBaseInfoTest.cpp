// The description of a protocol object.
#include <gtest/gtest.h>

#include <string>

#include "framework/HostServicePointers.h"
#include "tests/unit/framework/GuardedText.h"
#include "tests/unit/framework/TestProtocol.h"

namespace {

class NamedService final : public IInterface {
  public:
    NamedService(const char* name, int version) : name_(name), version_(version) {}
    void* ConvertTo(const char*) override { return nullptr; }
    const char* GetImpName() const override { return name_; }
    int GetImpVersion() const override { return version_; }

  private:
    const char* name_;
    int version_;
};

constexpr const char* kIdentityLines =
    "Protocol: TEST (7) v.12\n"
    "Implementation: TestProtocol v.34\n"
    "ProtocolBase v.100\n"
    "ProtLib v.200\n";

class ProtocolBaseInfoTest : public testing::Test {
  protected:
    ~ProtocolBaseInfoTest() override {
        piMultiTask = nullptr;
        piSerialFactory = nullptr;
        piSocketFactory = nullptr;
        piDiag = nullptr;
    }

    /// The whole text; checks that nothing in front of the buffer or behind it was written.
    static std::string infoOf(const ProtocolBase& protocol, int size = 1000) {
        GuardedText text(size);
        const int written = protocol.GetInfo(text.out(), size);
        EXPECT_TRUE(text.guardsIntact()) << "size " << size;
        EXPECT_GE(written, 0);
        EXPECT_LE(written, std::max(size, 0));
        return text.content().substr(0, static_cast<std::size_t>(written));
    }

    NamedService tasks_{"PanelTasks", 2};
    NamedService serial_{"PanelSerial", 31};
    NamedService sockets_{"PanelSockets", -4};
    TestProtocol protocol_;
};

TEST_F(ProtocolBaseInfoTest, WithoutServicesItDescribesTheProtocolAlone) {
    EXPECT_EQ(kIdentityLines, infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, PresentServicesFollowInFixedOrder) {
    piSocketFactory = &sockets_;
    piMultiTask = &tasks_;
    piSerialFactory = &serial_;
    EXPECT_EQ(std::string(kIdentityLines) + "PanelTasks v.2\nPanelSerial v.31\nPanelSockets v.-4\n",
              infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, MissingServiceIsPassedOver) {
    piMultiTask = &tasks_;
    piSocketFactory = &sockets_;
    EXPECT_EQ(std::string(kIdentityLines) + "PanelTasks v.2\nPanelSockets v.-4\n",
              infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, OtherServicesAreNotNamed) {
    piDiag = &tasks_;
    EXPECT_EQ(kIdentityLines, infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, ConvertedProtocolKeepsQuietAboutServices) {
    class Converted : public TestProtocol {
        bool IsConverted() const override { return true; }
    };
    piMultiTask = &tasks_;
    EXPECT_EQ(kIdentityLines, infoOf(Converted()));
}

TEST_F(ProtocolBaseInfoTest, EverySizeCutsTheTextWithoutATerminator) {
    piMultiTask = &tasks_;
    const std::string whole = infoOf(protocol_);
    for (int size = -2; size <= static_cast<int>(whole.size()) + 2; ++size) {
        GuardedText text(size);
        const int written = protocol_.GetInfo(text.out(), size);
        const auto room = static_cast<std::size_t>(std::max(size, 0));
        const std::string expected = whole.substr(0, room);
        EXPECT_EQ(static_cast<int>(expected.size()), written) << "size " << size;
        EXPECT_EQ(expected + std::string(room - expected.size(), GuardedText::kFill),
                  text.content())
            << "size " << size;
        EXPECT_TRUE(text.guardsIntact()) << "size " << size;
    }
}

TEST_F(ProtocolBaseInfoTest, TenByteBufferGivesTenBytesAndNoZero) {
    EXPECT_EQ("Protocol: ", infoOf(protocol_, 10));
}

TEST_F(ProtocolBaseInfoTest, NoBufferIsNeededForNoBytes) {
    EXPECT_EQ(0, protocol_.GetInfo(nullptr, 0));
    EXPECT_EQ(0, protocol_.GetInfo(nullptr, -5));
}

TEST_F(ProtocolBaseInfoTest, NullProtocolNameSuppressesEverythingBehindIt) {
    piMultiTask = &tasks_;
    protocol_.name = nullptr;
    EXPECT_EQ("Protocol: ", infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, NullImplementationNameSuppressesEverythingBehindIt) {
    piMultiTask = &tasks_;
    protocol_.implementation = nullptr;
    EXPECT_EQ("Protocol: TEST (7) v.12\nImplementation: ", infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, NullServiceNameSuppressesTheServicesBehindIt) {
    NamedService nameless(nullptr, 5);
    piMultiTask = &tasks_;
    piSerialFactory = &nameless;
    piSocketFactory = &sockets_;
    EXPECT_EQ(std::string(kIdentityLines) + "PanelTasks v.2\n", infoOf(protocol_));
}

TEST_F(ProtocolBaseInfoTest, WidestNumbersAreWrittenWhole) {
    NamedService low("Low", -2147483647 - 1);
    NamedService high("High", 2147483647);
    piMultiTask = &low;
    piSerialFactory = &high;
    EXPECT_EQ(std::string(kIdentityLines) + "Low v.-2147483648\nHigh v.2147483647\n",
              infoOf(protocol_));
}

}  // namespace
