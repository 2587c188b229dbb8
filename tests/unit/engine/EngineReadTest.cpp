// Whole tags read through the engine.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/unit/engine/EngineFakeDriver.h"
#include "tests/unit/engine/TypeTexts.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr unsigned char kUntouched = 0xA5;

class EngineReadTest : public testing::Test {
  protected:
    Bytes read(const std::string& uri) {
        const ITag* tag = driver_.tag(uri);
        Bytes value(static_cast<std::size_t>(tag->GetVarLength()), kUntouched);
        EXPECT_NE(driver_.Read(tag, value.data()), 0)
            << uri << ": " << driver_.GetLastErrorString();
        return value;
    }
    void expectRefused(const std::string& uri, int code, const std::string& text) {
        unsigned char value[16];
        std::fill(std::begin(value), std::end(value), kUntouched);
        EXPECT_EQ(0, driver_.Read(driver_.tag(uri), value)) << uri;
        EXPECT_EQ(code, driver_.GetLastError()) << uri;
        EXPECT_EQ(text, driver_.GetLastErrorString()) << uri;
        for (const unsigned char byte : value)
            EXPECT_EQ(kUntouched, byte) << uri;
    }
    Bytes bitsOf(const char* memory, int first, int count) {
        Bytes bits;
        for (int i = 0; i < count; ++i)
            bits.push_back(driver_.memory(memory).bit(first + i));
        return bits;
    }

    FakeDriver driver_;
};

}  // namespace

TEST_F(EngineReadTest, EveryTypeAtEveryLengthEqualsTheRegisters) {
    for (const char* memory : {"REG", "IREG", "LONG", "BYTE"}) {
        const int itemLength = driver_.memory(memory).itemLength();
        for (const TypeText& type : registerTypes()) {
            const std::string uri = std::string("1?") + memory + "?1201?" + type.text;
            const Bytes expected = type.bits ? bitsOf(memory, 1201 * itemLength * 8, type.bytes)
                                             : driver_.memory(memory).bytes(1201, type.bytes);
            EXPECT_EQ(expected, read(uri)) << uri;
        }
    }
}

TEST_F(EngineReadTest, BitsInsideRegistersBeginAtTheSubIndex) {
    for (const char* memory : {"REG", "LONG"}) {
        const int itemBits = driver_.memory(memory).itemLength() * 8;
        for (int subIndex = 0; subIndex < 40; ++subIndex) {
            for (const int count : {1, 2, 8, 15, 16, 17, 33, 100}) {
                const std::string uri = std::string("1?") + memory + "?77." +
                                        std::to_string(subIndex) + "?boolean-" +
                                        std::to_string(count);
                EXPECT_EQ(bitsOf(memory, 77 * itemBits + subIndex, count), read(uri)) << uri;
            }
        }
    }
}

TEST_F(EngineReadTest, SubIndexMovesBitsOnly) {
    EXPECT_EQ(driver_.memory("REG").bytes(77, 2), read("1?REG?77.5?short"));
}

TEST_F(EngineReadTest, BitsOfABitMemoryBeginAtTheOffset) {
    for (int offset = 0; offset < 18; ++offset) {
        for (const int count : {1, 2, 7, 8, 9, 64, 500, 2000, 2001, 4100}) {
            const std::string uri =
                "1?COIL?" + std::to_string(offset) + "?boolean-" + std::to_string(count);
            EXPECT_EQ(bitsOf("COIL", offset, count), read(uri)) << uri;
        }
    }
}

TEST_F(EngineReadTest, RequestsAreCutAtTheBlockLimit) {
    struct Row {
        const char* uri;
        const char* calls;
    };
    constexpr Row kRows[] = {
        {"1?REG?10?short", "read 10+1"},
        {"1?REG?10?short-125", "read 10+125"},
        {"1?REG?10?short-126", "read 10+125, read 135+1"},
        {"1?REG?10?short-250", "read 10+125, read 135+125"},
        {"1?REG?10?short-251", "read 10+125, read 135+125, read 260+1"},
        {"1?REG?10?string-249", "read 10+125"},
        {"1?REG?10?string-251", "read 10+125, read 135+1"},
        {"1?REG?10?byte", "read 10+1"},
        {"1?REG?10?double", "read 10+4"},
        {"1?REG?10.3?boolean", "read 10+1"},
        {"1?REG?10.15?boolean-2", "read 10+2"},
        {"1?LONG?10?float-62", "read 10+62"},
        {"1?LONG?10?float-63", "read 10+62, read 72+1"},
        {"1?LONG?10?double", "read 10+2"},
        {"1?COIL?21?boolean-10", "readBits 21+10"},
        {"1?COIL?21?boolean-2000", "readBits 21+2000"},
        {"1?COIL?21?boolean-2001", "readBits 21+2000, readBits 2021+1"},
        {"1?COIL?16?unsignedByte", "readBits 16+8"},
    };
    for (const Row& row : kRows) {
        read(row.uri);
        EXPECT_EQ(row.calls, driver_.calls()) << row.uri;
    }
}

TEST_F(EngineReadTest, LimitThatIsNoMultipleOfEightKeepsTheBitPositions) {
    driver_.setLimit(13);
    EXPECT_EQ(bitsOf("COIL", 5, 40), read("1?COIL?5?boolean-40"));
    EXPECT_EQ("readBits 5+13, readBits 18+13, readBits 31+13, readBits 44+1", driver_.calls());
}

TEST_F(EngineReadTest, LimitBelowOneItemReadsItemByItem) {
    driver_.setLimit(0);
    EXPECT_EQ(driver_.memory("REG").bytes(10, 4), read("1?REG?10?int"));
    EXPECT_EQ("read 10+1, read 11+1", driver_.calls());
    EXPECT_EQ(bitsOf("COIL", 6, 3), read("1?COIL?6?boolean-3"));
    EXPECT_EQ("readBits 6+1, readBits 7+1, readBits 8+1", driver_.calls());
}

TEST_F(EngineReadTest, AreaOfTheDriverItselfIsOneCall) {
    EXPECT_EQ(driver_.memory("AREA").bytes(0, 4), read("1?AREA?0?unsignedInt"));
    EXPECT_EQ("read 0+1", driver_.calls());
    EXPECT_EQ(bitsOf("FLAG", 0, 1), read("1?FLAG?0?boolean"));
    EXPECT_EQ("readBits 0+1", driver_.calls());
    EXPECT_EQ((Bytes{driver_.memory("FLAG").image()[0]}), read("1?FLAG?0?unsignedByte"));
    EXPECT_EQ("readBits 0+8", driver_.calls());
}

TEST_F(EngineReadTest, LastAddressIsReached) {
    EXPECT_EQ(driver_.memory("REG").bytes(65535, 2), read("1?REG?65535?short"));
    EXPECT_EQ(driver_.memory("REG").bytes(65535, 1), read("1?REG?65535?byte"));
    EXPECT_EQ(bitsOf("COIL", 65535, 1), read("1?COIL?65535?boolean"));
    EXPECT_EQ(bitsOf("SMALL", 9, 1), read("1?SMALL?9?boolean"));
}

TEST_F(EngineReadTest, TagsOutsideTheMemoryAreRefusedBeforeAnythingIsSent) {
    const std::string outside = "Tag exceeds the memory area";
    expectRefused("1?REG?65535?int", -1, outside);
    expectRefused("1?REG?65534?string-5", -1, outside);
    expectRefused("1?REG?65535.16?boolean", -1, outside);
    expectRefused("1?REG?-1?short", -1, outside);
    expectRefused("1?COIL?65535?boolean-2", -1, outside);
    expectRefused("1?COIL?-8?boolean", -1, outside);
    expectRefused("1?SMALL?10?boolean", -1, outside);
    EXPECT_EQ("", driver_.calls());
}

TEST_F(EngineReadTest, TagsWithoutLengthAreRefusedBeforeAnythingIsSent) {
    for (const char* uri : {"1?REG?0?int-0", "1?REG?0?int--3", "1?REG?0?string-", "1?REG?0?object",
                            "1?REG?0.3?boolean-0", "1?COIL?3?boolean-0", "1?COIL?3?boolean--20"})
        expectRefused(uri, -1, "Tag length is not positive");
    EXPECT_EQ("", driver_.calls());
}

TEST_F(EngineReadTest, OtherUnusableTagsAreRefusedBeforeAnythingIsSent) {
    expectRefused("1?REG?5.-1?boolean", -1, "Tag's bit index is negative");
    expectRefused("1?REG?5.-3?boolean-16", -1, "Tag's bit index is negative");
    expectRefused("1?NOWHERE?5?short", -1, "Tag has no memory type");
    expectRefused("1?COIL?5?unsignedByte", -1, "Only bits may begin inside a byte");
    EXPECT_EQ("", driver_.calls());
}

TEST_F(EngineReadTest, ConversionsAreApplied) {
    driver_.memory("REG").setBytes(4, {0x34, 0x12, 0x78, 0x56});
    EXPECT_EQ((Bytes{0xD2, 0x04}), read("1?REG?4?short(bcd)"));
    EXPECT_EQ((Bytes{0x12, 0x34, 0x56, 0x78}), read("1?REG?4?int(swap2)"));
    EXPECT_EQ((Bytes{0x78, 0x56, 0x34, 0x12}), read("1?REG?4?int(swap2,swap4)"));
    driver_.memory("COIL").setBit(9, 1);
    EXPECT_EQ((Bytes{0}), read("1?COIL?9?boolean(inv)"));
}

TEST_F(EngineReadTest, RefusedConversionLeavesTheValue) {
    driver_.memory("REG").setBytes(4, {0x3A, 0x12});
    expectRefused("1?REG?4?short(bcd)", -9, "read conversion error");
    expectRefused("1?REG?4?string-3(swap2)", -9, "read conversion error");
}

TEST_F(EngineReadTest, FailureInAnyBlockLeavesTheValue) {
    for (const char* uri : {"1?REG?10?short-300", "1?COIL?3?boolean-4100"}) {
        const ITag* tag = driver_.tag(uri);
        for (int call = 1; call <= 3; ++call) {
            Bytes value(static_cast<std::size_t>(tag->GetVarLength()), kUntouched);
            driver_.failCall(call);
            EXPECT_EQ(0, driver_.Read(tag, value.data())) << uri << " call " << call;
            EXPECT_EQ(-4, driver_.GetLastError());
            EXPECT_STREQ("No response", driver_.GetLastErrorString());
            EXPECT_EQ(Bytes(value.size(), kUntouched), value) << uri << " call " << call;
        }
        driver_.failCall(0);
    }
}
