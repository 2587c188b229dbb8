// A protocol with a tag of every kind that the console tests need.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "tests/unit/framework/GuardedText.h"
#include "tests/unit/framework/TestProtocol.h"

class ConsoleTest : public testing::Test {
  protected:
    static constexpr int kSize = 700;

    ConsoleTest() {
        protocol_.knownTags["byte"] = bytesShape(1);
        protocol_.knownTags["word"] = {ICU_Type::unsignedShort, ICU_Type::none, 2};
        protocol_.knownTags["dword"] = {ICU_Type::unsignedInt, ICU_Type::none, 4};
        protocol_.knownTags["bits"] = {ICU_Type::booleanArray, ICU_Type::boolean, 3, 0, 1};
        protocol_.knownTags["bcd"] = {ICU_Type::unsignedShort, ICU_Type::none, 2, 0, 0, {"bcd"}};
        protocol_.knownTags["b64"] = bytesShape(64);
        protocol_.knownTags["b65"] = bytesShape(65);
        protocol_.knownTags["nothing"] = bytesShape(0);
        protocol_.knownTags["odd"] = {
            ICU_Type::unsignedByteArray, ICU_Type::unsignedByte, 3, 0, 0, {"swap2"}};
    }

    /// The answer to a command that is recognised.
    std::string answerTo(const std::string& command) {
        GuardedText answer(kSize);
        EXPECT_EQ(1, protocol_.DoCommand(command.c_str(), answer.out(), kSize)) << command;
        EXPECT_TRUE(answer.guardsIntact()) << command;
        return answer.text();
    }

    void expectUnknown(const char* command) {
        GuardedText answer(kSize);
        EXPECT_EQ(0, protocol_.DoCommand(command, answer.out(), kSize));
        EXPECT_TRUE(answer.untouched());
    }

    TestProtocol protocol_;
};
