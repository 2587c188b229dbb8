// The console with memory running short: it answers 1 and frees its tag whatever happens.
#include <gtest/gtest.h>

#include "tests/abi/shortage/Operations.h"

namespace shortage {
namespace {

Operation console(const std::string& line) {
    return {"console " + line, Stage::started,
            [line](World& w) { return w.protocol->DoCommand(line.c_str(), w.text(), 512); },
            Refused::answer};
}

using ShortageConsoleTest = ShortageTest;

TEST_F(ShortageConsoleTest, OfTheConsole) {
    std::vector<Operation> operations;
    for (const char* line : {"help",
                             "info",
                             "xml",
                             "lasterror",
                             "getmaxtm",
                             "deletetags",
                             "setid 5 7",
                             "setid 123456789 987654321",
                             "setid 5 0",
                             "setid 5",
                             "setid with many words that are no numbers",
                             "getid",
                             "read",
                             "read with too many words for this command",
                             "write",
                             "write 1?HREG?400010?unsignedShort nothexadecimal",
                             "write 1?HREG?400010?unsignedShort zzzz",
                             "write 1?HREG?400010?unsignedShort 0100",
                             "write 1?NO?0?unsignedByte 01",
                             "write 1?a?b?c 01",
                             "read 1?HREG?999999?unsignedShort",
                             "read nothing that is a tag",
                             "read 1?HREG?400001?string-1000000000"})
        operations.push_back(console(line));
    for (const std::string& uri : uris())
        operations.push_back(console("read " + uri));
    std::string longWrite = "write 1?HREG?400010?unsignedShort-100 ";
    longWrite.append(400, '1');
    operations.push_back(console(longWrite));
    for (const char* line : {"", "a word that is unknown to the console", "setidentification 1 2"})
        operations.push_back(console(line));
    operations.push_back({"getid with overrides", Stage::started,
                          [](World& w) { return w.protocol->DoCommand("getid", w.text(), 400); },
                          Refused::answer,
                          [](World& w) {
                              char answer[100];
                              for (const char* line : {"setid 1 2", "setid 12345678 87654321"})
                                  w.protocol->DoCommand(line, answer, sizeof answer);
                          }});
    EXPECT_LT(0, expectHarmless(operations));
}

}  // namespace
}  // namespace shortage
