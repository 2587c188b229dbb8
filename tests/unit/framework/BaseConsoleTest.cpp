// What the text console answers.
#include <gtest/gtest.h>

#include <numeric>
#include <string>

#include "tests/unit/framework/ConsoleFixture.h"

namespace {

constexpr const char* kNoUri = "error: missing parameter (URI string)\n";

using Console = ConsoleTest;

TEST_F(Console, HelpListsTheDocumentedCommands) {
    EXPECT_EQ(answerTo("help"),
              "help - displays this message\n"
              "info - displays information about the protocol version\n"
              "xml  - displays the protocol xml description\n"
              "read uri - reads data pointed by uri string\n"
              "write uri hexData - writes data pointed by uri string\n"
              "lasterror - displays the last protocol error\n"
              "getmaxtm - displays the max time for executing a single read/write access\n");
}

TEST_F(Console, UnknownWordsLeaveTheAnswerUntouched) {
    for (const char* command : {"HELP", "Help", "helpme", "hel", "", " ", " help", "setid 1 2",
                                "getid", "\nhelp", "help\n", "?"}) {
        SCOPED_TRACE(std::string("\"") + command + '"');
        expectUnknown(command);
    }
    expectUnknown(nullptr);
    EXPECT_EQ(protocol_.GetLastError(), 1);
}

TEST_F(Console, TabsAroundAWordDoNotCount) {
    EXPECT_EQ(answerTo("\thelp\t"), answerTo("help"));
}

TEST_F(Console, CommandsWithoutParametersIgnoreFurtherWords) {
    protocol_.SetError(-4, "no response");
    for (const char* command : {"help", "info", "lasterror", "getmaxtm"}) {
        const std::string plain = answerTo(command);
        EXPECT_EQ(answerTo(std::string(command) + " a b  c"), plain) << command;
        EXPECT_EQ(answerTo(std::string(command) + " "), plain) << command;
    }
}

TEST_F(Console, InfoIsTheProtocolsDescription) {
    EXPECT_EQ(answerTo("info"),
              "Protocol: TEST (7) v.12\n"
              "Implementation: TestProtocol v.34\n"
              "ProtocolBase v.100\n"
              "ProtLib v.200\n");
}

TEST_F(Console, XmlEndsAtTheFirstZeroOfTheBlock) {
    class Described : public TestProtocol {
      public:
        const unsigned char* GetXml() const override {
            return reinterpret_cast<const unsigned char*>("compressedXML=5\0\x78\x9c...");
        }
    };
    Described protocol;
    GuardedText answer(40);
    EXPECT_EQ(protocol.DoCommand("xml", answer.out(), 40), 1);
    EXPECT_EQ(answer.content(), std::string("compressedXML=5").append(25, '\0'));
}

TEST_F(Console, XmlOfAProtocolWithoutDescriptionIsEmpty) {
    GuardedText answer(40);
    EXPECT_EQ(protocol_.DoCommand("xml", answer.out(), 40), 1);
    EXPECT_EQ(answer.content(), std::string(40, '\0'));
    EXPECT_TRUE(answer.guardsIntact());
}

TEST_F(Console, LastErrorIsTheTextOfTheLastFailure) {
    EXPECT_EQ(answerTo("lasterror"), "");
    protocol_.SetError(-4, "no response");
    EXPECT_EQ(answerTo("lasterror"), "no response");
}

TEST_F(Console, MaxTimeIsAskedForNoTagAndSigned) {
    for (const auto& [time, text] :
         {std::pair{1500, "maxtm = 1500 ms\n"}, std::pair{0, "maxtm = 0 ms\n"},
          std::pair{-5, "maxtm = -5 ms\n"},
          std::pair{-2147483647 - 1, "maxtm = -2147483648 ms\n"}}) {
        protocol_.maxTm = time;
        protocol_.maxTmAskedForNoTag = false;
        EXPECT_EQ(answerTo("getmaxtm"), text);
        EXPECT_TRUE(protocol_.maxTmAskedForNoTag);
    }
}

TEST_F(Console, DeleteTagsDestroysTheTagsAndSaysNothing) {
    protocol_.CreateTag("byte");
    protocol_.CreateTag("word");
    GuardedText answer(kSize);
    EXPECT_EQ(protocol_.DoCommand("deletetags", answer.out(), kSize), 1);
    EXPECT_TRUE(answer.untouched());
    EXPECT_EQ(protocol_.destroyedTags, 2);
}

TEST_F(Console, ReadNeedsExactlyOneUri) {
    for (const char* command :
         {"read", "read a b", "read byte ", "read  byte", "read byte word dword"}) {
        EXPECT_EQ(answerTo(command), kNoUri) << '"' << command << '"';
    }
    EXPECT_TRUE(protocol_.readLengths.empty());
}

TEST_F(Console, ReadShowsTheBytesInMemoryOrder) {
    protocol_.device = {0xAA, 0x0B, 0xCC, 0xDD};
    EXPECT_EQ(answerTo("read byte"), "aa\n");
    EXPECT_EQ(answerTo("read word"), "aa0b\n");
    EXPECT_EQ(answerTo("read dword"), "aa0bccdd\n");
    EXPECT_EQ(answerTo("read nothing"), "\n");
}

TEST_F(Console, ReadShowsTheRunTimeForm) {
    protocol_.device = {0b00001010};
    EXPECT_EQ(answerTo("read bits"), "010001\n");
    protocol_.device = {0x34, 0x12};
    EXPECT_EQ(answerTo("read bcd"), "d204\n");
}

TEST_F(Console, LongValuesAreShownWhole) {
    for (std::size_t length : {64u, 65u}) {
        protocol_.device.resize(length);
        std::iota(protocol_.device.begin(), protocol_.device.end(), static_cast<unsigned char>(0));
        const std::string answer = answerTo("read b" + std::to_string(length));
        ASSERT_EQ(answer.size(), 2 * length + 1) << length;
        EXPECT_EQ(answer.substr(0, 6), "000102");
        EXPECT_EQ(answer.substr(126, 3), length == 64 ? "3f\n" : "3f4");
    }
}

TEST_F(Console, UnknownUriIsAnsweredWithTheDriversText) {
    EXPECT_EQ(answerTo("read nowhere"), "Tag URI error: no such tag");
    EXPECT_EQ(answerTo("write nowhere 00"), "Tag URI error: no such tag");
}

TEST_F(Console, FailedReadIsAnsweredWithTheLastError) {
    protocol_.readResult = 0;
    EXPECT_EQ(answerTo("read byte"), "nobody answered the read");
    protocol_.readResult = 1;
    EXPECT_EQ(answerTo("read odd"), "read conversion error");
}

TEST_F(Console, ReadOfADerivedProtocolIsTheOneThatIsUsed) {
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
    EXPECT_EQ(protocol.DoCommand("read word", answer.out(), 20), 1);
    EXPECT_EQ(answer.text(), std::string("4200\n"));
}

TEST_F(Console, TagsOfTheConsoleAreFreedWhateverTheOutcome) {
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
        EXPECT_EQ(protocol_.destroyedTags, 1) << row.command;
    }
    protocol_.destroyedTags = 0;
    protocol_.DeleteTags();
    EXPECT_EQ(protocol_.destroyedTags, 0) << "a freed tag was still listed";
}

TEST_F(Console, TagsOfTheApplicationStay) {
    protocol_.CreateTag("byte");
    answerTo("read byte");
    EXPECT_EQ(protocol_.destroyedTags, 1);
    protocol_.DeleteTags();
    EXPECT_EQ(protocol_.destroyedTags, 2);
}

}  // namespace
