// Runs the transcripts of tests/transcripts against the driver. Their README tells how to read
// them.
#include <filesystem>
#include <fstream>
#include <sstream>

#include "framework/DataTypes.h"
#include "tests/unit/mrtu/DriverTest.h"

namespace {

using driver_test::Bytes;
using driver_test::DriverTest;
using driver_test::hex;
using driver_test::toHex;

/// The bytes of a line: hexadecimal, or the characters of an ASCII frame with CR and LF by name.
Bytes bytesOf(const std::string& text) {
    if (!text.starts_with(':')) return hex(text);
    std::string characters = text;
    const std::string end = " CR LF";
    if (characters.ends_with(end))
        characters.replace(characters.size() - end.size(), end.size(), "\r\n");
    return testing_support::characters(characters);
}

std::string textOf(const Bytes& bytes) {
    if (bytes.empty() || bytes.front() != ':') return toHex(bytes);
    std::string text(bytes.begin(), bytes.end());
    if (text.ends_with("\r\n")) text.replace(text.size() - 2, 2, " CR LF");
    return text;
}

bool isSigned(ICU_Type type) {
    return type == ICU_Type::byte || type == ICU_Type::short_ || type == ICU_Type::int_;
}

/// One exchange of a transcript: a call, the bytes on the line, what the host is told.
struct Call {
    int line = 0;
    std::string verb;
    std::string uri;
    std::string values;
    std::vector<std::string> sent;
    std::vector<std::string> replies;
    std::string outcome;
};

class TranscriptTest : public DriverTest, public ::testing::WithParamInterface<std::string> {
  protected:
    void take(const std::string& word, const std::string& rest, int number);
    void play(const Call& call);
    std::string carryOut(const Call& call);
    std::string failure() const {
        return "error " + std::to_string(driver->GetLastError()) + ' ' +
               driver->GetLastErrorString();
    }
    static std::string decimals(const ITag& tag, const Bytes& value);
    static Bytes valueOf(const ITag& tag, const std::string& decimals);

    Call call_;
    int played_ = 0;
};

/// Items in the host's order, the least significant byte first.
std::string TranscriptTest::decimals(const ITag& tag, const Bytes& value) {
    const auto length = static_cast<std::size_t>(ProtUtilsN::GetBasicLength(&tag));
    std::string text;
    for (std::size_t at = 0; at + length <= value.size(); at += length) {
        std::uint64_t number = 0;
        for (std::size_t byte = length; byte-- > 0;)
            number = number << 8 | value[at + byte];
        const bool negative =
            isSigned(ProtUtilsN::GetBasicType(&tag)) && (number >> (8 * length - 1) & 1U) != 0;
        if (negative) number = (std::uint64_t{1} << (8 * length)) - number;
        if (!text.empty()) text += ' ';
        if (negative) text += '-';
        text += std::to_string(number);
    }
    return text;
}

Bytes TranscriptTest::valueOf(const ITag& tag, const std::string& decimals) {
    Bytes value;
    std::istringstream words(decimals);
    for (std::int64_t number = 0; words >> number;)
        for (int byte = 0; byte < ProtUtilsN::GetBasicLength(&tag); ++byte)
            value.push_back(static_cast<std::uint8_t>(
                static_cast<std::uint64_t>(number) >> (8 * byte) & 0xFFU));
    return value;
}

std::string TranscriptTest::carryOut(const Call& call) {
    const Tag_MRTU& item = *tag(call.uri);
    const auto length = static_cast<std::size_t>(item.GetVarLength());
    if (call.verb == "write") {
        const Bytes value = valueOf(item, call.values);
        EXPECT_EQ(length, value.size()) << "the values do not fill the tag";
        return driver->Write(&item, value.data()) != 0 ? "done" : failure();
    }
    Bytes value(length);
    return driver->Read(&item, value.data()) != 0 ? decimals(item, value) : failure();
}

void TranscriptTest::play(const Call& call) {
    SCOPED_TRACE("line " + std::to_string(call.line) + ": " + call.verb + ' ' + call.uri);
    port.forget();
    for (const std::string& reply : call.replies)
        if (reply.empty())
            port.silence();
        else
            port.reply(bytesOf(reply));
    EXPECT_EQ(call.outcome, carryOut(call));
    std::vector<std::string> sent;
    for (const Bytes& request : port.sent())
        sent.push_back(textOf(request));
    EXPECT_EQ(call.sent, sent);
    EXPECT_EQ(0U, port.scriptLeft()) << "replies that nobody asked for";
}

/// One line of a transcript; `rest` is what stands behind its first word.
void TranscriptTest::take(const std::string& word, const std::string& rest, int number) {
    if (word == "config") {
        restartDriver();
        start(rest);
    } else if (word == "read" || word == "write") {
        const std::size_t end = rest.find(' ');
        EXPECT_EQ(0, call_.line) << "without an outcome";
        call_.line = number;
        call_.verb = word;
        call_.uri = rest.substr(0, end);
        if (end != std::string::npos) call_.values = rest.substr(end + 1);
    } else if (word == ">") {
        call_.sent.push_back(rest);
    } else if (word == "<") {
        call_.replies.push_back(rest);
    } else if (word == "=") {
        call_.outcome = rest;
        play(call_);
        call_ = Call();
        ++played_;
    } else {
        FAIL() << "line " << number << " is none of the known: " << word;
    }
}

TEST_P(TranscriptTest, IsWhatTheDriverDoes) {
    std::ifstream file(std::string(TRANSCRIPTS) + '/' + GetParam() + ".txt");
    ASSERT_TRUE(file.is_open());
    int number = 0;
    for (std::string line; std::getline(file, line);) {
        ++number;
        if (line.empty() || line.starts_with('#')) continue;
        const std::size_t blank = line.find(' ');
        take(line.substr(0, blank), blank == std::string::npos ? "" : line.substr(blank + 1),
             number);
        ASSERT_FALSE(HasFatalFailure());
    }
    EXPECT_EQ(0, call_.line) << "without an outcome";
    EXPECT_GT(played_, 3) << "hardly anything was played";
}

/// Every file of the folder, by its name.
std::vector<std::string> transcripts() {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(TRANSCRIPTS))
        if (entry.path().extension() == ".txt") names.push_back(entry.path().stem().string());
    std::sort(names.begin(), names.end());
    return names;
}

INSTANTIATE_TEST_SUITE_P(Files, TranscriptTest, ::testing::ValuesIn(transcripts()),
                         [](const auto& name) { return name.param; });

}  // namespace
