// Whole tags written through the engine.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/unit/engine/EngineFakeDriver.h"
#include "tests/unit/engine/TypeTexts.h"

namespace {

using Bytes = std::vector<unsigned char>;

class EngineWriteTest : public testing::Test {
  protected:
    static Bytes value(int length, bool bits) {
        Bytes bytes;
        for (int i = 0; i < length; ++i)
            bytes.push_back(static_cast<unsigned char>(bits ? i % 3 == 0 : i * 7 + 1));
        return bytes;
    }
    int write(const std::string& uri, const Bytes& bytes) {
        return driver_.Write(driver_.tag(uri), bytes.data());
    }
    void expectRefused(const std::string& uri, int code, const std::string& text) {
        EXPECT_EQ(0, write(uri, value(64, false))) << uri;
        EXPECT_EQ(code, driver_.GetLastError()) << uri;
        EXPECT_EQ(text, driver_.GetLastErrorString()) << uri;
    }

    FakeDriver driver_;
};

}  // namespace

TEST_F(EngineWriteTest, EveryTypeAtEveryLengthChangesItsOwnBytesOnly) {
    for (const char* memory : {"REG", "LONG", "BYTE"}) {
        FakeMemory& area = driver_.memory(memory);
        for (const TypeText& type : registerTypes()) {
            FakeMemory expected = area;
            const Bytes bytes = value(type.bytes, type.bits);
            if (!type.bits) expected.setBytes(1201, bytes);
            for (int i = 0; type.bits && i < type.bytes; ++i)
                expected.setBit(1201 * area.itemLength() * 8 + i, bytes[static_cast<size_t>(i)]);
            const std::string uri = std::string("1?") + memory + "?1201?" + type.text;
            EXPECT_NE(write(uri, bytes), 0) << uri << ": " << driver_.GetLastErrorString();
            EXPECT_TRUE(area.image() == expected.image()) << uri;
        }
    }
}

TEST_F(EngineWriteTest, BitsInsideRegistersLeaveTheirNeighboursAlone) {
    for (const char* memory : {"REG", "LONG"}) {
        FakeMemory& area = driver_.memory(memory);
        for (int subIndex = 0; subIndex < 40; ++subIndex) {
            for (const int count : {1, 2, 15, 16, 17, 33}) {
                FakeMemory expected = area;
                const Bytes bits = value(count, true);
                for (int i = 0; i < count; ++i) {
                    expected.setBit(77 * area.itemLength() * 8 + subIndex + i,
                                    bits[static_cast<size_t>(i)]);
                }
                const std::string uri = std::string("1?") + memory + "?77." +
                                        std::to_string(subIndex) + "?boolean-" +
                                        std::to_string(count);
                EXPECT_NE(write(uri, bits), 0) << uri;
                EXPECT_TRUE(area.image() == expected.image()) << uri;
            }
        }
    }
}

TEST_F(EngineWriteTest, BitsOfABitMemoryLeaveTheirNeighboursAlone) {
    for (const int limit : {1968, 13}) {
        driver_.setLimit(limit);
        for (int offset = 0; offset < 18; ++offset) {
            for (const int count : {1, 2, 8, 9, 30, 500, 1968, 1969}) {
                FakeMemory expected = driver_.memory("COIL");
                const Bytes bits = value(count, true);
                for (int i = 0; i < count; ++i)
                    expected.setBit(offset + i, bits[static_cast<size_t>(i)]);
                const std::string uri =
                    "1?COIL?" + std::to_string(offset) + "?boolean-" + std::to_string(count);
                EXPECT_NE(write(uri, bits), 0) << uri;
                EXPECT_TRUE(driver_.memory("COIL").image() == expected.image()) << uri;
            }
        }
    }
}

TEST_F(EngineWriteTest, RequestsAreCutAtTheBlockLimit) {
    struct Row {
        const char* uri;
        const char* calls;
    };
    constexpr Row kRows[] = {
        {"1?REG?10?short", "write 10+1"},
        {"1?REG?10?short-123", "write 10+123"},
        {"1?REG?10?short-124", "write 10+123, write 133+1"},
        {"1?REG?10?short-247", "write 10+123, write 133+123, write 256+1"},
        {"1?LONG?10?float-62", "write 10+61, write 71+1"},
        {"1?COIL?21?boolean-10", "writeBits 21+10"},
        {"1?COIL?21?boolean-1969", "writeBits 21+1968, writeBits 1989+1"},
        {"1?COIL?16?unsignedByte", "writeBits 16+8"},
    };
    for (const Row& row : kRows) {
        EXPECT_NE(write(row.uri, value(4000, true)), 0) << row.uri;
        EXPECT_EQ(row.calls, driver_.calls()) << row.uri;
    }
}

TEST_F(EngineWriteTest, PartOfARegisterIsReadFirst) {
    struct Row {
        const char* uri;
        const char* calls;
    };
    constexpr Row kRows[] = {
        {"1?REG?10?byte", "read 10+1, write 10+1"},
        {"1?REG?10.3?boolean", "read 10+1, write 10+1"},
        {"1?REG?10.15?boolean-2", "read 10+2, write 10+2"},
        {"1?REG?10?string-3", "read 10+2, write 10+2"},
        {"1?LONG?10?short", "read 10+1, write 10+1"},
        {"1?REG?10?string-249", "read 10+125, write 10+123, write 133+2"},
    };
    for (const Row& row : kRows) {
        EXPECT_NE(write(row.uri, value(300, true)), 0) << row.uri;
        EXPECT_EQ(row.calls, driver_.calls()) << row.uri;
    }
}

TEST_F(EngineWriteTest, RegistersInFrontOfTheBitAreNotTouched) {
    EXPECT_NE(write("1?REG?10.37?boolean", {1}), 0);
    EXPECT_EQ("read 12+1, write 12+1", driver_.calls());
}

TEST_F(EngineWriteTest, WholeRegistersOfBitsNeedNoRead) {
    EXPECT_NE(write("1?REG?10.16?boolean-32", value(32, true)), 0);
    EXPECT_EQ("write 11+2", driver_.calls());
}

TEST_F(EngineWriteTest, LimitBelowOneItemWritesItemByItem) {
    driver_.setLimit(0);
    EXPECT_NE(write("1?REG?10?int", value(4, false)), 0);
    EXPECT_EQ("write 10+1, write 11+1", driver_.calls());
}

TEST_F(EngineWriteTest, AreaOfTheDriverItselfIsOneCallWithoutARead) {
    EXPECT_NE(write("1?AREA?0?unsignedInt", {1, 2, 3, 4}), 0);
    EXPECT_EQ("write 0+1", driver_.calls());
    EXPECT_EQ((Bytes{1, 2, 3, 4}), driver_.memory("AREA").bytes(0, 4));
    EXPECT_NE(write("1?AREA?0?unsignedByte", {9}), 0);
    EXPECT_EQ("write 0+1", driver_.calls());
    EXPECT_EQ((Bytes{9, 0, 0, 0}), driver_.memory("AREA").bytes(0, 4));
    EXPECT_NE(write("1?FLAG?0?unsignedByte", {0x52}), 0);
    EXPECT_EQ("writeBits 0+8", driver_.calls());
    EXPECT_EQ(0x52, driver_.memory("FLAG").image()[0]);
    EXPECT_NE(write("1?FLAG?0?boolean", {1}), 0);
    EXPECT_EQ("writeBits 0+1", driver_.calls());
}

TEST_F(EngineWriteTest, NothingIsWrittenWhenTheReadFails) {
    for (const char* uri : {"1?REG?10.3?boolean", "1?REG?10?byte", "1?REG?10?string-301"}) {
        const Bytes before = driver_.memory("REG").image();
        driver_.failCall(1);
        EXPECT_EQ(0, write(uri, value(301, true))) << uri;
        EXPECT_EQ(-4, driver_.GetLastError()) << uri;
        EXPECT_EQ(std::string::npos, driver_.calls().find("write")) << uri;
        EXPECT_TRUE(driver_.memory("REG").image() == before) << uri;
    }
}

TEST_F(EngineWriteTest, FailureEndsTheBlocks) {
    driver_.failCall(2);
    EXPECT_EQ(0, write("1?REG?10?short-300", value(600, false)));
    EXPECT_EQ(-4, driver_.GetLastError());
    EXPECT_EQ("write 10+123, write 133+123", driver_.calls());
}

TEST_F(EngineWriteTest, ReadOnlyMemoryIsRefused) {
    expectRefused("1?IREG?10?short", -1, "Memory type is read only");
    expectRefused("1?IREG?10.3?boolean", -1, "Memory type is read only");
    EXPECT_EQ("", driver_.calls());
}

TEST_F(EngineWriteTest, UnusableTagsAreRefusedBeforeAnythingIsSent) {
    expectRefused("1?REG?65535?int", -1, "Tag exceeds the memory area");
    expectRefused("1?REG?65535.16?boolean", -1, "Tag exceeds the memory area");
    expectRefused("1?COIL?65535?boolean-2", -1, "Tag exceeds the memory area");
    expectRefused("1?REG?0?int-0", -1, "Tag length is not positive");
    expectRefused("1?COIL?0?boolean-0", -1, "Tag length is not positive");
    expectRefused("1?REG?0.-1?boolean", -1, "Tag's bit index is negative");
    expectRefused("1?COIL?3?unsignedByte", -1, "Only bits may begin inside a byte");
    expectRefused("1?NOWHERE?0?short", -1, "Tag has no memory type");
    EXPECT_EQ("", driver_.calls());
}

TEST_F(EngineWriteTest, ConversionsAreApplied) {
    EXPECT_NE(write("1?REG?4?short(bcd)", {0xD2, 0x04}), 0);
    EXPECT_EQ((Bytes{0x34, 0x12}), driver_.memory("REG").bytes(4, 2));
    EXPECT_NE(write("1?REG?4?int(swap2)", {1, 2, 3, 4}), 0);
    EXPECT_EQ((Bytes{2, 1, 4, 3}), driver_.memory("REG").bytes(4, 4));
    EXPECT_NE(write("1?REG?4?boolean(inv)", {1}), 0);
    EXPECT_EQ((Bytes{2}), driver_.memory("REG").bytes(4, 1));
}

TEST_F(EngineWriteTest, RefusedConversionWritesNothing) {
    expectRefused("1?REG?4?short(neg,bcd)", -9, "write conversion error");
    expectRefused("1?REG?4?string-3(swap2)", -9, "write conversion error");
    expectRefused("1?COIL?4?boolean(bcd,neg)", -9, "write conversion error");
    EXPECT_EQ(std::string::npos, driver_.calls().find("write"));
}
