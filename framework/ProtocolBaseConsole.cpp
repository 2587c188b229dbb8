// The text console: single tags and the object's state, one command line at a time.
#include <array>
#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include "framework/ProtocolBase.h"
#include "framework/ScratchBuffer.h"
#include "framework/TextUtils.h"

namespace {

// "deletetags" stays out of it: it pulls the tags from under a running application.
constexpr const char* kHelp =
    "help - displays this message\n"
    "info - displays information about the protocol version\n"
    "xml  - displays the protocol xml description\n"
    "read uri - reads data pointed by uri string\n"
    "write uri hexData - writes data pointed by uri string\n"
    "lasterror - displays the last protocol error\n"
    "getmaxtm - displays the max time for executing a single read/write access\n";

/// Bytes of a value that are handled without the heap.
constexpr int kLocalValueBytes = 64;

/// What must be left before a byte is shown: its two digits, the line end and the zero, and one
/// more.
constexpr int kRoomBeforeByte = 4;

/// @return 1, the result of every recognised command.
int reply(char* answer, const char* text, int size) {
    ProtUtilsN::copyBounded(answer, text != nullptr ? text : "", size);
    return 1;
}

/// Writes two digits a byte while there is room, then the line end and a zero.
void showBytes(const unsigned char* value, int length, char* answer, int size) {
    static constexpr char kDigits[] = "0123456789abcdef";
    int at = 0;
    for (int i = 0; i < length && size - at > kRoomBeforeByte; ++i) {
        answer[at++] = kDigits[value[i] >> 4];
        answer[at++] = kDigits[value[i] & 0x0F];
    }
    if (at < size) answer[at++] = '\n';
    if (at < size) answer[at] = '\0';
}

/// @return 0..15, or -1 for what is no hexadecimal digit.
int nibbleOf(char digit) {
    if (digit >= '0' && digit <= '9') return digit - '0';
    if (digit >= 'A' && digit <= 'F') return digit - 'A' + 10;
    if (digit >= 'a' && digit <= 'f') return digit - 'a' + 10;
    return -1;
}

/// REQUIRES: `hex` has an even number of characters and `bytes` room for half of them.
bool decodeHex(const std::string& hex, unsigned char* bytes) {
    for (std::size_t i = 0; i < hex.size(); i += 2) {
        const int high = nibbleOf(hex[i]);
        const int low = nibbleOf(hex[i + 1]);
        if (high < 0 || low < 0) return false;
        bytes[i / 2] = static_cast<unsigned char>(high * 16 + low);
    }
    return true;
}

bool hasTwoDigitsPerByte(const std::string& hex, int length) {
    return length >= 0 && hex.size() == 2 * static_cast<std::size_t>(length);
}

}  // namespace

/// A tag of one command: taken out of the list and destroyed whatever the command's end.
class ProtocolBase::ConsoleTag {
  public:
    ConsoleTag(ProtocolBase& owner, const std::string& uri)
        : owner_(owner), tag_(owner.CreateTag(uri.c_str())) {}
    ~ConsoleTag() { owner_.FreeTag(tag_); }
    ConsoleTag(const ConsoleTag&) = delete;
    ConsoleTag& operator=(const ConsoleTag&) = delete;

    /// Null when it could not be made; the error is set then.
    const ITag* get() const { return tag_; }

  private:
    ProtocolBase& owner_;
    ITag* tag_;
};

int ProtocolBase::DoCommand(const char* command, char* answer, int size) {
    if (command == nullptr) return 0;
    // The word is told without memory, so that what it stands for is recognised at any time.
    std::string_view line = command;
    bool more = false;
    const std::string_view word = ProtUtilsN::takePiece(line, ' ', more);
    if (word == "help") return reply(answer, kHelp, size);
    if (word == "info") return commandInfo(answer, size);
    // The copy ends at the first zero, so only the line in front of the compressed text is shown.
    if (word == "xml") return reply(answer, reinterpret_cast<const char*>(GetXml()), size);
    if (word == "lasterror") return reply(answer, GetLastErrorString(), size);
    if (word == "getmaxtm") return commandMaxTm(answer, size);
    if (word == "deletetags") {
        DeleteTags();
        return 1;
    }
    if (word != "read" && word != "write") return 0;

    const bool done = guardedBy(false, [&] {
        std::vector<std::string> words;
        ProtUtilsN::ParseSubstrings(command, words, ' ');
        word == "read" ? commandRead(words, answer, size) : commandWrite(words, answer, size);
        return true;
    });
    return done ? 1 : reply(answer, GetLastErrorString(), size);
}

int ProtocolBase::commandInfo(char* answer, int size) const {
    const int length = GetInfo(answer, size);
    if (length >= 0 && length < size) answer[length] = '\0';
    return 1;
}

int ProtocolBase::commandMaxTm(char* answer, int size) const {
    std::array<char, 32> text;
    std::snprintf(text.data(), text.size(), "maxtm = %d ms\n", GetMaxTm(nullptr));
    return reply(answer, text.data(), size);
}

int ProtocolBase::commandRead(const std::vector<std::string>& words, char* answer, int size) {
    if (words.size() != 2) return reply(answer, "error: missing parameter (URI string)\n", size);
    const ConsoleTag tag(*this, words[1]);
    if (tag.get() == nullptr || !showValue(tag.get(), answer, size))
        return reply(answer, GetLastErrorString(), size);
    return 1;
}

/// @return false, with the error set, when the tag cannot be read.
bool ProtocolBase::showValue(const ITag* tag, char* answer, int size) {
    if (refuseRead(tag)) return false;
    const int length = tag->GetVarLength();
    ScratchBuffer<kLocalValueBytes> value(length);
    if (value.data() == nullptr) return outOfMemory() != 0;
    if (Read(tag, value.data()) == 0) return false;
    showBytes(value.data(), length, answer, size);
    return true;
}

int ProtocolBase::commandWrite(const std::vector<std::string>& words, char* answer, int size) {
    if (words.size() != 3)
        return reply(answer, "error: missing parameters (URI string + data)\n", size);
    const ConsoleTag tag(*this, words[1]);
    if (tag.get() == nullptr) return reply(answer, GetLastErrorString(), size);
    return reply(answer, writeHex(tag.get(), words[2]), size);
}

const char* ProtocolBase::writeHex(const ITag* tag, const std::string& hex) {
    const int length = tag->GetVarLength();
    if (!hasTwoDigitsPerByte(hex, length)) return "error: incorrect length of data to write\n";
    ScratchBuffer<kLocalValueBytes> value(length);
    if (value.data() == nullptr) {
        outOfMemory();
        return GetLastErrorString();
    }
    if (!decodeHex(hex, value.data())) return "error: incorrect hex data\n";
    return Write(tag, value.data()) != 0 ? "written ok\n" : GetLastErrorString();
}
