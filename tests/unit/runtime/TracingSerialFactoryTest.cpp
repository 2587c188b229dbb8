#include "runtime/TracingSerialFactory.h"

#include <gmock/gmock.h>

#include <deque>
#include <string>
#include <vector>

namespace {

using namespace runtime;
using ::testing::ElementsAre;
using Bytes = std::vector<std::uint8_t>;

/// Answers from a list of bytes; `alive` ends it.
class ScriptedPort final : public ISerialPort {
  public:
    std::deque<std::uint8_t> waiting;
    bool alive = true;
    int configured = 0;
    int purged = 0;

    int configure(int, int, int, int, int) override { return ++configured; }
    void purge() override { ++purged; }
    int receiveByte(unsigned char* byte, int, int) override {
        if (waiting.empty() || !alive) return 0;
        *byte = waiting.front();
        waiting.pop_front();
        return 1;
    }
    int send(const unsigned char*, int) override { return alive ? 1 : 0; }
    int receiveFrame(unsigned char* data, int most, int, int, int* received, int) override {
        *received = 0;
        while (!waiting.empty() && *received < most)
            receiveByte(data + (*received)++, 0, 0);
        return alive && *received > 0 ? 1 : 0;
    }
};

class ScriptedFactory final : public ISerialFactory {
  public:
    ScriptedPort port;
    int open = 0;

    ISerialPort* openPort(const char* name) override {
        if (std::string(name) != "com1") return nullptr;
        ++open;
        return &port;
    }
    void releasePort(ISerialPort* released) override {
        EXPECT_EQ(&port, released);
        --open;
    }
    void* ConvertTo(const char*) override { return nullptr; }
    const char* GetImpName() const override { return "ScriptedFactory"; }
    int GetImpVersion() const override { return 100; }
};

struct Seen {
    TraceDirection direction;
    std::string port;
    Bytes bytes;
    bool complete;
};

struct TracingSerialFactoryTest : ::testing::Test {
    void SetUp() override {
        port = tracing.openPort("com1");
        ASSERT_NE(port, nullptr);
    }
    void answer(const Bytes& bytes) {
        inner.port.waiting.insert(inner.port.waiting.end(), bytes.begin(), bytes.end());
    }
    /// What a driver does: throw away, send, first byte, the rest.
    void transact(const Bytes& request, const Bytes& reply) {
        unsigned char buffer[513];
        while (port->receiveByte(buffer, 0, 0) != 0) {
        }
        port->send(request.data(), static_cast<int>(request.size()));
        answer(reply);
        if (port->receiveByte(buffer, 2000, 0) == 0) return;
        int received = 0;
        port->receiveFrame(buffer + 1, 512, 2000, 13, &received, 0);
    }

    ScriptedFactory inner;
    std::vector<Seen> seen;
    TracingSerialFactory tracing{inner, [this](const TraceEvent& event) {
                                     seen.push_back({event.direction,
                                                     event.port,
                                                     {event.bytes.begin(), event.bytes.end()},
                                                     event.complete});
                                 }};
    ISerialPort* port = nullptr;
};

TEST_F(TracingSerialFactoryTest, FirstByteAndRestAreOneFrame) {
    transact({1, 3, 0}, {1, 3, 2, 0xAB});
    ASSERT_EQ(2u, seen.size());
    EXPECT_EQ(TraceDirection::Sent, seen[0].direction);
    EXPECT_EQ("com1", seen[0].port);
    EXPECT_THAT(seen[0].bytes, ElementsAre(1, 3, 0));
    EXPECT_EQ(TraceDirection::Received, seen[1].direction);
    EXPECT_THAT(seen[1].bytes, ElementsAre(1, 3, 2, 0xAB));
    EXPECT_TRUE(seen[1].complete);
}

TEST_F(TracingSerialFactoryTest, LateBytesAreShownBeforeTheNextRequest) {
    answer({9, 9});
    transact({1}, {2, 3});
    ASSERT_EQ(3u, seen.size());
    EXPECT_EQ(TraceDirection::Received, seen[0].direction);
    EXPECT_THAT(seen[0].bytes, ElementsAre(9, 9));
    EXPECT_EQ(TraceDirection::Sent, seen[1].direction);
    EXPECT_THAT(seen[2].bytes, ElementsAre(2, 3));
}

TEST_F(TracingSerialFactoryTest, ReplyOfOneByteIsAFrame) {
    transact({1}, {7});
    ASSERT_EQ(2u, seen.size());
    EXPECT_THAT(seen[1].bytes, ElementsAre(7));
    EXPECT_TRUE(seen[1].complete);
}

TEST_F(TracingSerialFactoryTest, NoReplyShowsTheRequestOnly) {
    transact({1, 2}, {});
    ASSERT_EQ(1u, seen.size());
    EXPECT_EQ(0u, tracing.counts().framesReceived);
}

TEST_F(TracingSerialFactoryTest, FailedSendIsMarked) {
    inner.port.alive = false;
    transact({1, 2}, {});
    ASSERT_EQ(1u, seen.size());
    EXPECT_FALSE(seen[0].complete);
}

TEST_F(TracingSerialFactoryTest, UnfinishedBytesAreShownAtTheRelease) {
    answer({5});
    unsigned char byte = 0;
    ASSERT_NE(port->receiveByte(&byte, 0, 0), 0);
    EXPECT_TRUE(seen.empty());
    tracing.releasePort(port);
    ASSERT_EQ(1u, seen.size());
    EXPECT_THAT(seen[0].bytes, ElementsAre(5));
    EXPECT_EQ(0, inner.open);
}

TEST_F(TracingSerialFactoryTest, CountsFramesAndBytes) {
    transact({1, 2, 3}, {4, 5});
    transact({1, 2, 3}, {4, 5, 6, 7});
    const TraceCounts counts = tracing.counts();
    EXPECT_EQ(2u, counts.framesSent);
    EXPECT_EQ(2u, counts.framesReceived);
    EXPECT_EQ(6u, counts.bytesSent);
    EXPECT_EQ(6u, counts.bytesReceived);
}

TEST_F(TracingSerialFactoryTest, EverythingElseGoesThrough) {
    EXPECT_EQ(1, port->configure(9600, 0, 8, 1, 0));
    port->purge();
    EXPECT_EQ(1, inner.port.configured);
    EXPECT_EQ(1, inner.port.purged);
    EXPECT_EQ(nullptr, tracing.openPort("com2"));
    EXPECT_EQ(static_cast<ISerialFactory*>(&tracing), tracing.ConvertTo("ISerialFactory"));
    EXPECT_EQ(nullptr, tracing.ConvertTo("IOther"));
}

TEST_F(TracingSerialFactoryTest, ForeignPortIsNotReleased) {
    tracing.releasePort(nullptr);
    tracing.releasePort(&inner.port);
    EXPECT_EQ(1, inner.open);
}

TEST_F(TracingSerialFactoryTest, ReleasesWhatIsStillOpen) {
    ScriptedFactory factory;
    {
        TracingSerialFactory shortLived(factory, {});
        ASSERT_NE(shortLived.openPort("com1"), nullptr);
    }
    EXPECT_EQ(0, factory.open);
}

}  // namespace
