// The console never touches a byte outside the caller's buffer, whatever its size.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>

#include "tests/unit/framework/GuardedText.h"
#include "tests/unit/framework/TestProtocol.h"

namespace {

class ConsoleBoundsTest : public testing::Test {
  protected:
    ConsoleBoundsTest() {
        protocol_.knownTags["dword"] = {ICU_Type::unsignedInt, ICU_Type::none, 4};
        protocol_.knownTags["b65"] = bytesShape(65);
        protocol_.device.assign(65, 0xA5);
        protocol_.SetError(-4, "no response");
    }

    std::string wholeAnswer(const std::string& command) {
        GuardedText answer(1000);
        EXPECT_EQ(1, protocol_.DoCommand(command.c_str(), answer.out(), 1000)) << command;
        return answer.text();
    }

    /// Runs the command with every size around its answer's length and compares the whole buffer.
    template <class Expected>
    void tryEverySize(const std::string& command, Expected expected) {
        const int longest = static_cast<int>(wholeAnswer(command).size()) + 2;
        for (int size : {-2147483647 - 1, -1000, -1})
            tryOne(command, size, expected(0));
        for (int size = 0; size <= longest; ++size)
            tryOne(command, size, expected(static_cast<std::size_t>(size)));
    }

    void tryOne(const std::string& command, int size, const std::string& expected) {
        GuardedText answer(size);
        EXPECT_EQ(1, protocol_.DoCommand(command.c_str(), answer.out(), size));
        EXPECT_EQ(expected, answer.content()) << command << ", size " << size;
        EXPECT_TRUE(answer.guardsIntact()) << command << ", size " << size;
    }

    TestProtocol protocol_;
};

/// At most `size` bytes, zeroes behind a shorter text.
std::string boundedCopy(const std::string& text, std::size_t size) {
    std::string copy = text.substr(0, size);
    copy.resize(size, '\0');
    return copy;
}

std::string fill(std::size_t count) {
    return std::string(count, GuardedText::kFill);
}

TEST_F(ConsoleBoundsTest, CopiedAnswersAreCutOrPaddedWithZeroes) {
    for (const char* command :
         {"help", "lasterror", "getmaxtm", "read", "read a b", "read nowhere", "write",
          "write dword 0", "write dword 0000000g", "write dword 01020304", "write nowhere 00"}) {
        const std::string whole = wholeAnswer(command);
        ASSERT_FALSE(whole.empty()) << command;
        tryEverySize(command, [&whole](std::size_t size) { return boundedCopy(whole, size); });
    }
}

TEST_F(ConsoleBoundsTest, FailedReadIsCutOrPaddedToo) {
    protocol_.readResult = 0;
    const std::string whole = wholeAnswer("read dword");
    ASSERT_EQ("nobody answered the read", whole);
    tryEverySize("read dword", [&whole](std::size_t size) { return boundedCopy(whole, size); });
}

TEST_F(ConsoleBoundsTest, XmlIsCutOrPaddedToo) {
    class Described : public TestProtocol {
      public:
        const unsigned char* GetXml() const override {
            return reinterpret_cast<const unsigned char*>("compressedXML=5\0\x78\x9c...");
        }
    };
    Described protocol;
    for (int size = -1; size <= 17; ++size) {
        GuardedText answer(size);
        EXPECT_EQ(1, protocol.DoCommand("xml", answer.out(), size));
        const auto room = static_cast<std::size_t>(std::max(size, 0));
        EXPECT_EQ(boundedCopy("compressedXML=5", room), answer.content()) << size;
        EXPECT_TRUE(answer.guardsIntact()) << size;
    }
}

TEST_F(ConsoleBoundsTest, InfoIsTerminatedOnlyWhereThereIsRoomAndNeverPadded) {
    const std::string whole = wholeAnswer("info");
    tryEverySize("info", [&whole](std::size_t size) {
        if (size <= whole.size()) return whole.substr(0, size);
        return whole + '\0' + fill(size - whole.size() - 1);
    });
}

/// A byte is shown while more than 4 bytes of room are left; each takes 2 of it.
std::string shownBytes(const std::string& digits, std::size_t size) {
    std::string shown;
    while (shown.size() < digits.size() && size - shown.size() > 4)
        shown += digits.substr(shown.size(), 2);
    if (shown.size() < size) shown += '\n';
    if (shown.size() < size) shown += '\0';
    return shown + fill(size - shown.size());
}

TEST_F(ConsoleBoundsTest, ReadValuesLeaveRoomForTheLineEnd) {
    protocol_.device = {0xAA, 0xBB, 0xCC, 0xDD};
    tryEverySize("read dword", [](std::size_t size) { return shownBytes("aabbccdd", size); });
}

TEST_F(ConsoleBoundsTest, LongReadValuesAreCutToFit) {
    std::string digits;
    for (int i = 0; i < 65; ++i)
        digits += "a5";
    tryEverySize("read b65", [&digits](std::size_t size) { return shownBytes(digits, size); });
}

TEST_F(ConsoleBoundsTest, FourBytesIntoNineGiveThree) {
    protocol_.device = {0xAA, 0xBB, 0xCC, 0xDD};
    tryOne("read dword", 9, std::string("aabbcc\n\0", 8) + fill(1));
}

TEST_F(ConsoleBoundsTest, TinyBuffersOfAReadHoldWhatFits) {
    tryOne("read dword", 0, "");
    tryOne("read dword", 1, "\n");
    tryOne("read dword", 2, std::string("\n\0", 2));
    tryOne("read dword", 4, std::string("\n\0", 2) + fill(2));
    tryOne("read dword", 5, std::string("a5\n\0", 4) + fill(1));
}

TEST_F(ConsoleBoundsTest, NoBufferIsNeededForNoBytes) {
    for (const char* command : {"help", "info", "xml", "lasterror", "getmaxtm", "read dword",
                                "read", "write dword 01020304", "deletetags"}) {
        for (int size : {0, -1})
            EXPECT_EQ(1, protocol_.DoCommand(command, nullptr, size)) << command << ' ' << size;
    }
}

}  // namespace
