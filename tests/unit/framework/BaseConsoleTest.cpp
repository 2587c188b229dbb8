// What the text console answers.
#include <gtest/gtest.h>

#include <numeric>
#include <string>

#include "tests/unit/framework/ConsoleFixture.h"

namespace {

constexpr const char* kNoUri = "error: missing parameter (URI string)\n";

using BaseConsoleTest = ConsoleTest;

TEST_F(BaseConsoleTest, HelpListsTheDocumentedCommands) {
    EXPECT_EQ(
        "help - displays this message\n"
        "info - displays information about the protocol version\n"
        "xml  - displays the protocol xml description\n"
        "read uri - reads data pointed by uri string\n"
        "write uri hexData - writes data pointed by uri string\n"
        "lasterror - displays the last protocol error\n"
        "getmaxtm - displays the max time for executing a single read/write access\n",
        answerTo("help"));
}

TEST_F(BaseConsoleTest, UnknownWordsLeaveTheAnswerUntouched) {
    for (const char* command : {"HELP", "Help", "helpme", "hel", "", " ", " help", "setid 1 2",
                                "getid", "\nhelp", "help\n", "?"}) {
        SCOPED_TRACE(std::string("\"") + command + '"');
        expectUnknown(command);
    }
    expectUnknown(nullptr);
    EXPECT_EQ(1, protocol_.GetLastError());
}

TEST_F(BaseConsoleTest, TabsAroundAWordDoNotCount) {
    EXPECT_EQ(answerTo("help"), answerTo("\thelp\t"));
}

TEST_F(BaseConsoleTest, CommandsWithoutParametersIgnoreFurtherWords) {
    protocol_.SetError(-4, "no response");
    for (const char* command : {"help", "info", "lasterror", "getmaxtm"}) {
        const std::string plain = answerTo(command);
        EXPECT_EQ(plain, answerTo(std::string(command) + " a b  c")) << command;
        EXPECT_EQ(plain, answerTo(std::string(command) + " ")) << command;
    }
}

TEST_F(BaseConsoleTest, InfoIsTheProtocolsDescription) {
    EXPECT_EQ(
        "Protocol: TEST (7) v.12\n"
        "Implementation: TestProtocol v.34\n"
        "ProtocolBase v.100\n"
        "ProtLib v.200\n",
        answerTo("info"));
}

TEST_F(BaseConsoleTest, XmlEndsAtTheFirstZeroOfTheBlock) {
    class Described : public TestProtocol {
      public:
        const unsigned char* GetXml() const override {
            return reinterpret_cast<const unsigned char*>("compressedXML=5\0\x78\x9c...");
        }
    };
    Described protocol;
    GuardedText answer(40);
    EXPECT_EQ(1, protocol.DoCommand("xml", answer.out(), 40));
    EXPECT_EQ(std::string("compressedXML=5").append(25, '\0'), answer.content());
}

TEST_F(BaseConsoleTest, XmlOfAProtocolWithoutDescriptionIsEmpty) {
    GuardedText answer(40);
    EXPECT_EQ(1, protocol_.DoCommand("xml", answer.out(), 40));
    EXPECT_EQ(std::string(40, '\0'), answer.content());
    EXPECT_TRUE(answer.guardsIntact());
}

TEST_F(BaseConsoleTest, LastErrorIsTheTextOfTheLastFailure) {
    EXPECT_EQ("", answerTo("lasterror"));
    protocol_.SetError(-4, "no response");
    EXPECT_EQ("no response", answerTo("lasterror"));
}

TEST_F(BaseConsoleTest, MaxTimeIsAskedForNoTagAndSigned) {
    for (const auto& [time, text] :
         {std::pair{1500, "maxtm = 1500 ms\n"}, std::pair{0, "maxtm = 0 ms\n"},
          std::pair{-5, "maxtm = -5 ms\n"},
          std::pair{-2147483647 - 1, "maxtm = -2147483648 ms\n"}}) {
        protocol_.maxTm = time;
        protocol_.maxTmAskedForNoTag = false;
        EXPECT_EQ(text, answerTo("getmaxtm"));
        EXPECT_TRUE(protocol_.maxTmAskedForNoTag);
    }
}

TEST_F(BaseConsoleTest, DeleteTagsDestroysTheTagsAndSaysNothing) {
    protocol_.CreateTag("byte");
    protocol_.CreateTag("word");
    GuardedText answer(kSize);
    EXPECT_EQ(1, protocol_.DoCommand("deletetags", answer.out(), kSize));
    EXPECT_TRUE(answer.untouched());
    EXPECT_EQ(2, protocol_.destroyedTags);
}

TEST_F(BaseConsoleTest, ReadNeedsExactlyOneUri) {
    for (const char* command :
         {"read", "read a b", "read byte ", "read  byte", "read byte word dword"}) {
        EXPECT_EQ(kNoUri, answerTo(command)) << '"' << command << '"';
    }
    EXPECT_TRUE(protocol_.readLengths.empty());
}

TEST_F(BaseConsoleTest, ReadShowsTheBytesInMemoryOrder) {
    protocol_.device = {0xAA, 0x0B, 0xCC, 0xDD};
    EXPECT_EQ("aa\n", answerTo("read byte"));
    EXPECT_EQ("aa0b\n", answerTo("read word"));
    EXPECT_EQ("aa0bccdd\n", answerTo("read dword"));
    EXPECT_EQ("\n", answerTo("read nothing"));
}

TEST_F(BaseConsoleTest, ReadShowsTheRunTimeForm) {
    protocol_.device = {0b00001010};
    EXPECT_EQ("010001\n", answerTo("read bits"));
    protocol_.device = {0x34, 0x12};
    EXPECT_EQ("d204\n", answerTo("read bcd"));
}

TEST_F(BaseConsoleTest, LongValuesAreShownWhole) {
    for (std::size_t length : {64u, 65u}) {
        protocol_.device.resize(length);
        std::iota(protocol_.device.begin(), protocol_.device.end(), static_cast<unsigned char>(0));
        const std::string answer = answerTo("read b" + std::to_string(length));
        ASSERT_EQ(2 * length + 1, answer.size()) << length;
        EXPECT_EQ("000102", answer.substr(0, 6));
        EXPECT_EQ(length == 64 ? "3f\n" : "3f4", answer.substr(126, 3));
    }
}

TEST_F(BaseConsoleTest, UnknownUriIsAnsweredWithTheDriversText) {
    EXPECT_EQ("Tag URI error: no such tag", answerTo("read nowhere"));
    EXPECT_EQ("Tag URI error: no such tag", answerTo("write nowhere 00"));
}

TEST_F(BaseConsoleTest, FailedReadIsAnsweredWithTheLastError) {
    protocol_.readResult = 0;
    EXPECT_EQ("nobody answered the read", answerTo("read byte"));
    protocol_.readResult = 1;
    EXPECT_EQ("read conversion error", answerTo("read odd"));
}

TEST_F(BaseConsoleTest, ReadOfADerivedProtocolIsTheOneThatIsUsed) {
    class OwnRead : public TestProtocol {
      public:
        int Read(const ITag*, unsigned char* value) override {
            value[0] = 0x42;
            return 1;
        }
    };
    OwnRead protocol;
    protocol.knownTags["word"] = {ICU_Type::unsignedShort, ICU_Type::none, 2};
    GuardedText answer(20);
    EXPECT_EQ(1, protocol.DoCommand("read word", answer.out(), 20));
    EXPECT_EQ(std::string("4200\n"), answer.text());
}

TEST_F(BaseConsoleTest, TagsOfTheConsoleAreFreedWhateverTheOutcome) {
    struct Row {
        const char* command;
        int readResult;
        int writeResult;
    };
    const Row rows[] = {
        {"read byte", 1, 1},     {"read byte", 0, 1},    {"read odd", 1, 1},
        {"read b65", 1, 1},      {"read b65", 0, 1},     {"write byte 00", 1, 1},
        {"write byte 00", 1, 0}, {"write byte 0", 1, 1}, {"write byte xx", 1, 1},
    };
    for (const Row& row : rows) {
        protocol_.readResult = row.readResult;
        protocol_.writeResult = row.writeResult;
        protocol_.destroyedTags = 0;
        answerTo(row.command);
        EXPECT_EQ(1, protocol_.destroyedTags) << row.command;
    }
    protocol_.destroyedTags = 0;
    protocol_.DeleteTags();
    EXPECT_EQ(0, protocol_.destroyedTags) << "a freed tag was still listed";
}

TEST_F(BaseConsoleTest, TagsOfTheApplicationStay) {
    protocol_.CreateTag("byte");
    answerTo("read byte");
    EXPECT_EQ(1, protocol_.destroyedTags);
    protocol_.DeleteTags();
    EXPECT_EQ(2, protocol_.destroyedTags);
}

}  // namespace
