// What a protocol answers for capabilities that it does not have.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "tests/unit/framework/TestProtocol.h"

namespace {

constexpr const char* kNoEvents = "protocol does not support event channel";
constexpr int kUntouched = 77;

struct DefaultRow {
    const char* operation;
    /// True when the operation answered as a protocol without the capability should.
    std::function<bool(TestProtocol&, const ITag*)> answersAsExpected;
    int errorCode = kUntouched;
    const char* errorText = "an earlier failure";
};

unsigned char data[8];
idal_error_t status[2];

std::vector<DefaultRow> transferRows() {
    return {
        {"WriteBlock", [](auto& p, auto* t) { return p.WriteBlock(t, data, 1) == 0; }, -3,
         "Optimized writing not supported"},
        {"MaxDatagramItems", [](auto& p, auto* t) { return p.MaxDatagramItems(t) == 0; }},
        {"MaxDatagramLength", [](auto& p, auto* t) { return p.MaxDatagramLength(t) == 0; }},
        {"CanCoexistInDatagram", [](auto& p, auto* t) { return !p.CanCoexistInDatagram(t, t); }},
        {"ReadDatagram", [](auto& p, auto* t) { return p.ReadDatagram(&t, 1, data) == 0; }},
        {"CanAddToDatagram", [](auto& p, auto* t) { return !p.CanAddToDatagram(&t, 1, t); }},
        {"ReadDatagramWithStatus",
         [](auto& p, auto* t) { return p.ReadDatagramWithStatus(&t, 1, data, status) == 0; }},
        {"MultipleReadSupported", [](auto& p, auto*) { return !p.MultipleReadSupported(); }},
        {"MultipleRead", [](auto& p, auto*) { return p.MultipleRead(nullptr) == 0; }},
        {"MultipleWriteSupported", [](auto& p, auto*) { return !p.MultipleWriteSupported(); }},
        {"MultipleWrite", [](auto& p, auto*) { return p.MultipleWrite(nullptr) == 0; }},
        {"CanReadBitBlock", [](auto& p, auto* t) { return !p.CanReadBitBlock(t); }},
        {"ReadBitBlock", [](auto& p, auto* t) { return p.ReadBitBlock(t, data, 1) == 0; }},
        {"MaxUnusedGap", [](auto& p, auto* t) { return p.MaxUnusedGap(t) == 16777215; }},
        {"NeedsReadBeforeWrite", [](auto& p, auto* t) { return !p.NeedsReadBeforeWrite(t); }},
        {"CanWriteDatagrams", [](auto& p, auto* t) { return !p.CanWriteDatagrams(t); }},
        {"CanAddToWriteDatagram",
         [](auto& p, auto* t) { return !p.CanAddToWriteDatagram(&t, 1, t); }},
        {"WriteDatagramWithStatus",
         [](auto& p, auto* t) { return p.WriteDatagramWithStatus(&t, 1, data, status) == 0; }},
        {"CanWriteBitBlock", [](auto& p, auto* t) { return !p.CanWriteBitBlock(t); }},
        {"WriteBitBlock", [](auto& p, auto* t) { return p.WriteBitBlock(t, data, 1) == 0; }},
        {"readObject", [](auto& p, auto* t) { return p.readObject(t, nullptr) == 0; }, -1,
         "read object not supported"},
        {"writeObject", [](auto& p, auto* t) { return p.writeObject(t, nullptr) == 0; }, -1,
         "write object not supported"},
    };
}

std::vector<DefaultRow> eventRows() {
    IEventProcessor* const processor = nullptr;
    return {
        {"createEventChannel(kind)",
         [](auto& p, auto*) { return p.createEventChannel(3) == nullptr; }, -1, kNoEvents},
        {"createEventChannel(processor)",
         [processor](auto& p, auto*) { return p.createEventChannel(processor) == nullptr; }, -1,
         kNoEvents},
        {"deleteEventChannel",
         [](auto& p, auto*) {
             p.deleteEventChannel(nullptr);
             return true;
         }},
        {"addEventSource", [](auto& p, auto*) { return p.addEventSource(nullptr, "s") == 0; }, -1,
         kNoEvents},
        {"addAlarmEvents", [](auto& p, auto*) { return p.addAlarmEvents(nullptr, nullptr) == 0; },
         -1, kNoEvents},
        {"frontEvent", [](auto& p, auto*) { return p.frontEvent(nullptr) == nullptr; }},
        {"popEvent",
         [](auto& p, auto*) {
             p.popEvent(nullptr);
             return true;
         }},
        {"createAlarm", [](auto& p, auto*) { return p.createAlarm("s") == nullptr; }, -1,
         "protocol does not support alarms"},
        {"deleteAlarm",
         [](auto& p, auto*) {
             p.deleteAlarm(nullptr);
             return true;
         }},
        {"listAlarms", [](auto& p, auto*) { return p.listAlarms(nullptr) == 0; }},
        {"quitAlarm", [](auto& p, auto*) { return p.quitAlarm(nullptr) == 0; }},
        {"createTrend", [](auto& p, auto*) { return p.createTrend("s") == nullptr; }, -1,
         "protocol does not support trends"},
        {"deleteTrend",
         [](auto& p, auto*) {
             p.deleteTrend(nullptr);
             return true;
         }},
        {"readTrend",
         [](auto& p, auto*) {
             unsigned long long next = 5;
             return p.readTrend(nullptr, 0, 1, next, 1, false, nullptr) == 0 && next == 5;
         }},
    };
}

std::vector<DefaultRow> otherRows() {
    return {
        {"Start", [](auto& p, auto*) { return p.Start() == 1; }},
        {"Stop", [](auto& p, auto*) { return p.Stop() == 1; }},
        {"GetXml", [](auto& p, auto*) { return p.GetXml() == nullptr; }},
        {"IsConverted", [](auto& p, auto*) { return !p.IsConverted(); }},
        {"Extend", [](auto& p, auto*) { return p.Extend(0, nullptr) == 0; }},
        {"GetInterface", [](auto& p, auto*) { return p.GetInterface("IProtocol") == nullptr; }},
        {"vcsGetCapability", [](auto& p, auto*) { return p.vcsGetCapability() == 0; }},
        {"vcsGetComParams",
         [](auto& p, auto*) {
             char text[] = "untouched";
             return p.vcsGetComParams(text, 9) == 0 && std::string(text) == "untouched";
         }},
        {"vcsActivateInterleaved", [](auto& p, auto*) { return p.vcsActivateInterleaved(1) == 0; }},
        {"hasPlcTimestamp", [](auto& p, auto* t) { return !p.hasPlcTimestamp(t); }},
    };
}

void expectDefaults(const std::vector<DefaultRow>& rows) {
    const TestTag tag("1", bytesShape(1));
    for (const DefaultRow& row : rows) {
        SCOPED_TRACE(row.operation);
        TestProtocol protocol;
        protocol.SetError(kUntouched, "an earlier failure");
        EXPECT_TRUE(row.answersAsExpected(protocol, &tag));
        EXPECT_EQ(row.errorCode, protocol.GetLastError());
        EXPECT_STREQ(row.errorText, protocol.GetLastErrorString());
    }
}

TEST(ProtocolBaseDefaultsTest, TransfersThatADriverDoesNotOfferAreRefused) {
    expectDefaults(transferRows());
}

TEST(ProtocolBaseDefaultsTest, EventsAlarmsAndTrendsAreRefused) {
    expectDefaults(eventRows());
}

TEST(ProtocolBaseDefaultsTest, NothingElseIsPromised) {
    expectDefaults(otherRows());
}

TEST(ProtocolBaseDefaultsTest, OffsetsAreComparedUnsigned) {
    struct Row {
        unsigned int a;
        unsigned int b;
        bool before;
    };
    const Row rows[] = {{1, 2, true},           {2, 1, false},           {2, 2, false},
                        {5, 0x80000000u, true}, {0x80000000u, 5, false}, {0, 0xFFFFFFFFu, true}};
    const TestProtocol protocol;
    for (const Row& row : rows) {
        TagShape shapeA = bytesShape(1);
        shapeA.byteOffset = row.a;
        TagShape shapeB = bytesShape(1);
        shapeB.byteOffset = row.b;
        const TestTag a("a", shapeA);
        const TestTag b("b", shapeB);
        EXPECT_EQ(row.before, protocol.IsBefore(&a, &b)) << row.a << " " << row.b;
    }
}

TEST(ProtocolBaseDefaultsTest, TagIsAdjacentToTheOneThatEndsWhereItBegins) {
    const TestTag first("a", {ICU_Type::short_, ICU_Type::none, 2, 10});
    const TestTag next("b", {ICU_Type::short_, ICU_Type::none, 2, 12});
    const TestTag later("c", {ICU_Type::short_, ICU_Type::none, 2, 13});
    const TestProtocol protocol;
    EXPECT_TRUE(protocol.IsAdjacent(&next, &first));
    EXPECT_FALSE(protocol.IsAdjacent(&first, &next));
    EXPECT_FALSE(protocol.IsAdjacent(&later, &first));
    EXPECT_FALSE(protocol.IsAdjacent(&first, &first));
}

TEST(ProtocolBaseDefaultsTest, BitTagsAreAdjacentToTheBit) {
    const TestTag three("a", {ICU_Type::booleanArray, ICU_Type::boolean, 3, 4, 5});
    const TestTag next("b", {ICU_Type::boolean, ICU_Type::none, 1, 5, 0});
    const TestTag gap("c", {ICU_Type::boolean, ICU_Type::none, 1, 5, 1});
    const TestProtocol protocol;
    EXPECT_TRUE(protocol.IsAdjacent(&next, &three));
    EXPECT_FALSE(protocol.IsAdjacent(&gap, &three));
}

}  // namespace
