// The driver's console commands.
#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

#include "framework/TextUtils.h"
#include "mrtu/Protocol_MRTU.h"

namespace {

using ProtUtilsN::copyBounded;

constexpr char kHelp[] =
    "setid n m - set the node id n to m\n"
    "getid - get all changed node id's\n";

int textLength(const char* text, int size) {
    return size > 0 ? static_cast<int>(strnlen(text, static_cast<std::size_t>(size))) : 0;
}

/// A line about a node and its replacement, composed without the heap.
class Line {
  public:
    Line(int node, const char* between, int replacement)
        : length_(std::snprintf(text_.data(), text_.size(), "id %d%s%d\n", node, between,
                                replacement)) {}

    const char* text() const { return text_.data(); }
    int length() const { return length_; }

  private:
    std::array<char, 64> text_;
    int length_;
};

}  // namespace

int Protocol_MRTU::DoCommand(const char* command, char* answer, int size) {
    if (command == nullptr) return 0;
    std::string_view line = command;
    bool more = false;
    const std::string_view word = ProtUtilsN::takePiece(line, ' ', more);
    if (word == "help") return commandHelp(command, answer, size);
    if (word == "setid") {
        commandSetId(command, answer, size);
        return 1;
    }
    if (word == "getid") {
        commandGetId(answer, size);
        return 1;
    }
    return ProtgenProtocol::DoCommand(command, answer, size);
}

int Protocol_MRTU::commandHelp(const char* command, char* answer, int size) {
    int used = 0;
    if (ProtgenProtocol::DoCommand(command, answer, size) != 0) used = textLength(answer, size);
    copyBounded(answer + used, kHelp, size - used);
    return 1;
}

void Protocol_MRTU::commandSetId(const char* command, char* answer, int size) {
    const bool done = guardedBy(false, [&] {
        std::vector<std::string> words;
        ProtUtilsN::ParseSubstrings(command, words, ' ');
        if (words.size() != 3) {
            copyBounded(answer, "invalid format\n", size);
            return true;
        }
        const int node = ProtUtilsN::parseInteger(words[1].c_str());
        const int wanted = ProtUtilsN::parseInteger(words[2].c_str());
        const int replacement = wanted != 0 ? wanted : node;
        nodeOverrides_.setValue(node, replacement, GetIdent());
        const Line text(node, " set to ", replacement);
        copyBounded(answer, text.text(), size);
        return true;
    });
    if (!done) copyBounded(answer, GetLastErrorString(), size);
}

void Protocol_MRTU::commandGetId(char* answer, int size) {
    const bool done = guardedBy(false, [&] {
        listIds(answer, size);
        return true;
    });
    if (!done) copyBounded(answer, GetLastErrorString(), size);
}

void Protocol_MRTU::listIds(char* answer, int size) const {
    copyBounded(answer, "no node configurated\n", size);
    for (const auto& [node, replacement] : nodeOverrides_.replacements()) {
        const Line line(node, " -> ", replacement);
        if (line.length() > size) return;
        answer = std::copy_n(line.text(), line.length(), answer);
        size -= line.length();
        // A line that fills the answer to its last byte goes without a terminating zero.
        if (size > 0) *answer = '\0';
    }
}
