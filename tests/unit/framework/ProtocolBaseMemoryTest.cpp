// What happens when there is no memory: an error, nothing lost, nothing thrown.
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "tests/support/MemoryShortage.h"
#include "tests/unit/framework/GuardedText.h"
#include "tests/unit/framework/TestProtocol.h"

namespace {

using testing_support::MemoryShortage;

/// Notes nothing, so that it needs no memory itself.
class FrugalProtocol : public TestProtocol {
  public:
    int ReadBlock(const ITag*, unsigned char* data, int length) override {
        ++transfers;
        answer(data, length);
        return 1;
    }
    int Write(const ITag*, const unsigned char*) override {
        ++transfers;
        return 1;
    }
    ITag* CreateTagBase(const char*) override {
        ITag* tag = ready;
        ready = nullptr;
        return tag;
    }
    ITag* ready = nullptr;
    int transfers = 0;
};

class ProtocolBaseMemoryTest : public testing::Test {
  protected:
    void expectOutOfMemory() const {
        EXPECT_EQ(-1, protocol_.GetLastError());
        EXPECT_STREQ("Out of memory", protocol_.GetLastErrorString());
    }

    FrugalProtocol protocol_;
    std::vector<unsigned char> value_ = std::vector<unsigned char>(300, 0xEE);
};

TEST_F(ProtocolBaseMemoryTest, LongTagIsNotReadWithoutMemory) {
    const TestTag tag("1", bytesShape(65));
    int ok = 1;
    {
        const MemoryShortage shortage;
        ok = protocol_.Read(&tag, value_.data());
    }
    EXPECT_EQ(0, ok);
    expectOutOfMemory();
    EXPECT_EQ(0, protocol_.transfers);
    EXPECT_EQ(0xEE, value_[0]);
}

TEST_F(ProtocolBaseMemoryTest, ShortTagNeedsNoMemory) {
    const TestTag tag("1", bytesShape(64));
    protocol_.device = {1};
    int ok = 0;
    {
        const MemoryShortage shortage;
        ok = protocol_.Read(&tag, value_.data());
    }
    EXPECT_EQ(1, ok);
    EXPECT_EQ(1, value_[0]);
    EXPECT_EQ(0, value_[63]);
}

TEST_F(ProtocolBaseMemoryTest, LongArrayIsNeitherReadNorWrittenWithoutMemory) {
    const TestTag tag("1", bytesShape(257));
    int read = 1;
    int written = 1;
    {
        const MemoryShortage shortage;
        read = protocol_.readArrayItem(&tag, 0, value_.data());
        written = protocol_.writeArrayItem(&tag, 0, value_.data());
    }
    EXPECT_EQ(0, read);
    EXPECT_EQ(0, written);
    expectOutOfMemory();
    EXPECT_EQ(0, protocol_.transfers);
}

TEST_F(ProtocolBaseMemoryTest, TagThatCannotBeListedIsDestroyed) {
    int destroyed = 0;
    protocol_.ready = new TestTag("1", bytesShape(1), &destroyed);
    const ITag* tag = nullptr;
    {
        const MemoryShortage shortage;
        tag = protocol_.CreateTag("1");
    }
    EXPECT_EQ(nullptr, tag);
    EXPECT_EQ(1, destroyed);
    expectOutOfMemory();
}

TEST_F(ProtocolBaseMemoryTest, CommonErrorTextsNeedNoMemory) {
    const std::string text(256, 'x');
    {
        const MemoryShortage shortage;
        protocol_.SetError(-6, text.c_str());
    }
    EXPECT_EQ(text, protocol_.GetLastErrorString());
}

TEST_F(ProtocolBaseMemoryTest, LongErrorTextIsCutWithoutMemory) {
    const std::string text(5000, 'x');
    {
        const MemoryShortage shortage;
        protocol_.SetError(-6, text.c_str());
    }
    EXPECT_EQ(-6, protocol_.GetLastError());
    const std::string kept = protocol_.GetLastErrorString();
    EXPECT_GE(kept.size(), 256u);
    EXPECT_EQ(text.substr(0, kept.size()), kept);
}

TEST_F(ProtocolBaseMemoryTest, IdentStaysWithoutMemory) {
    protocol_.SetIdent("line");
    const std::string ident(100, 'i');
    {
        const MemoryShortage shortage;
        protocol_.SetIdent(ident.c_str());
    }
    EXPECT_STREQ("line", protocol_.GetIdent());
    expectOutOfMemory();
}

TEST_F(ProtocolBaseMemoryTest, CommonTagErrorsNeedNoMemory) {
    const TestTag tag("a URI that is longer than a short string", bytesShape(1));
    {
        const MemoryShortage shortage;
        protocol_.SetTagError(&tag);
    }
    EXPECT_STREQ("Tag URI error: a URI that is longer than a short string - ",
                 protocol_.GetLastErrorString());
}

TEST_F(ProtocolBaseMemoryTest, LongTagErrorIsReplacedByTheShortage) {
    const TestTag tag(std::string(300, 'u'), bytesShape(1));
    {
        const MemoryShortage shortage;
        protocol_.SetTagError(&tag);
    }
    expectOutOfMemory();
}

/// What became of one command.
struct Outcome {
    int result = 0;
    bool ranShort = false;
};

/// Runs a command while only `requests` requests for memory are granted. Whatever happens, the
/// buffer's surroundings stay, a shortage is told in words and the command's tag is gone.
Outcome runShort(const std::string& command, int requests) {
    int destroyed = 0;
    FrugalProtocol protocol;
    auto tag = std::make_unique<TestTag>("1", bytesShape(65), &destroyed);
    protocol.ready = tag.get();
    GuardedText answer(200);
    Outcome outcome;
    {
        const MemoryShortage shortage(requests);
        outcome.result = protocol.DoCommand(command.c_str(), answer.out(), 200);
    }
    const bool tagWasTaken = protocol.ready == nullptr;
    if (tagWasTaken) static_cast<void>(tag.release());
    EXPECT_EQ(tagWasTaken ? 1 : 0, destroyed);

    outcome.ranShort = protocol.GetLastError() == -1;
    EXPECT_STREQ(outcome.ranShort ? "Out of memory" : "", protocol.GetLastErrorString());
    EXPECT_TRUE(answer.guardsIntact());
    EXPECT_EQ(1, outcome.result);
    if (outcome.ranShort) {
        EXPECT_EQ("Out of memory", answer.text());
    }
    return outcome;
}

TEST_F(ProtocolBaseMemoryTest, ConsoleTellsEveryShortageAndLeavesNothingBehind) {
    const std::string uri = "a-uri-that-is-longer-than-a-short-string";
    for (const std::string& command :
         {"read " + uri, "write " + uri + " " + std::string(130, '0')}) {
        int refusals = 0;
        Outcome last;
        for (int requests = 0; requests < 40; ++requests) {
            SCOPED_TRACE(command + ", requests granted: " + std::to_string(requests));
            last = runShort(command, requests);
            if (last.ranShort) ++refusals;
        }
        EXPECT_GT(refusals, 0) << command;
        EXPECT_FALSE(last.ranShort) << command << " needs more requests than were tried";
    }
}

TEST_F(ProtocolBaseMemoryTest, ConsoleNeedsNoneWhereItQuotesNothing) {
    for (const char* command : {"help", "info", "xml", "lasterror", "getmaxtm", "deletetags"})
        EXPECT_FALSE(runShort(command, 0).ranShort) << command;
}

}  // namespace
