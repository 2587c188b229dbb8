// The driver's console commands.
#include <algorithm>
#include <cstring>

#include "framework/TextUtils.h"
#include "mrtu/Protocol_MRTU.h"

namespace {

using ProtUtilsN::CopyBounded;

constexpr char kHelp[] =
    "setid n m - set the node id n to m\n"
    "getid - get all changed node id's\n";

int textLength(const char* text, int size) {
    return size > 0 ? static_cast<int>(strnlen(text, static_cast<std::size_t>(size))) : 0;
}

}  // namespace

int Protocol_MRTU::DoCommand(const char* command, char* answer, int size) {
    if (command == nullptr) return 0;
    std::vector<std::string> words;
    ProtUtilsN::ParseSubstrings(command, words, ' ');
    if (words[0] == "help") return commandHelp(command, answer, size);
    if (words[0] == "setid") {
        commandSetId(words, answer, size);
        return 1;
    }
    if (words[0] == "getid") {
        commandGetId(answer, size);
        return 1;
    }
    return ProtgenProtocol::DoCommand(command, answer, size);
}

int Protocol_MRTU::commandHelp(const char* command, char* answer, int size) {
    int used = 0;
    if (ProtgenProtocol::DoCommand(command, answer, size) != 0) used = textLength(answer, size);
    CopyBounded(answer + used, kHelp, size - used);
    return 1;
}

void Protocol_MRTU::commandSetId(const std::vector<std::string>& words, char* answer, int size) {
    if (words.size() != 3) return CopyBounded(answer, "invalid format\n", size);
    const int node = ProtUtilsN::ParseInteger(words[1].c_str());
    const int wanted = ProtUtilsN::ParseInteger(words[2].c_str());
    const int replacement = wanted != 0 ? wanted : node;
    nodeOverrides_.setValue(node, replacement, GetIdent());
    const std::string text =
        "id " + std::to_string(node) + " set to " + std::to_string(replacement) + '\n';
    CopyBounded(answer, text.c_str(), size);
}

void Protocol_MRTU::commandGetId(char* answer, int size) const {
    CopyBounded(answer, "no node configurated\n", size);
    for (const auto& [node, replacement] : nodeOverrides_.replacements()) {
        const std::string line =
            "id " + std::to_string(node) + " -> " + std::to_string(replacement) + '\n';
        const int length = static_cast<int>(line.size());
        if (length > size) return;
        answer = std::copy(line.begin(), line.end(), answer);
        size -= length;
        // A line that fills the answer to its last byte goes without a terminating zero.
        if (size > 0) *answer = '\0';
    }
}
