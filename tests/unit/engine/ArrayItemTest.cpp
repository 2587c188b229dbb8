// Single items of arrays.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "framework/DataTypes.h"
#include "tests/unit/engine/EngineFakeDriver.h"

namespace {

using Bytes = std::vector<unsigned char>;

constexpr unsigned char kUntouched = 0xA5;

// Arrays of all element types with every conversion that each accepts, alone and in chains, and at
// lengths that leave partly used registers and swap groups.
std::vector<std::string> arrays() {
    std::vector<std::string> types;
    for (const char* element :
         {"byte-", "short-", "int-", "unsignedByte-", "unsignedShort-", "unsignedInt-", "float-",
          "double-", "uint64-", "int64-", "string-", "binary-", "boolean-", "time-"}) {
        for (const char* count : {"1", "2", "5", "8", "11", "24"}) {
            for (const char* conversions :
                 {"", "(swap2)", "(swap4)", "(swap8)", "(neg)", "(inv)", "(bcd)", "(swapnibble)",
                  "(swap2,swap4)", "(swap8,neg)", "(neg,swap4,inv)", "(bcd,swap2)", "(nonsense)"})
                types.push_back(std::string(element) + count + conversions);
        }
    }
    return types;
}

class ArrayItemTest : public testing::Test {
  protected:
    static std::size_t itemLength(const ITag* tag) {
        return static_cast<std::size_t>(ProtUtilsN::GetBasicLength(tag));
    }
    static Bytes itemOf(const ITag* tag, const Bytes& whole, int index) {
        const auto first = whole.begin() + static_cast<std::ptrdiff_t>(itemLength(tag)) * index;
        return {first, first + static_cast<std::ptrdiff_t>(itemLength(tag))};
    }
    static Bytes newItem(const ITag* tag, int index) {
        Bytes item;
        for (std::size_t i = 0; i < itemLength(tag); ++i)
            item.push_back(static_cast<unsigned char>(index % 2 + (i == 0 ? 6 : 0)));
        if (ProtUtilsN::IsBitType(tag)) item[0] = static_cast<unsigned char>(index % 2);
        return item;
    }
    Bytes readItem(const ITag* tag, int index) {
        Bytes item(itemLength(tag), kUntouched);
        EXPECT_NE(driver_.readArrayItem(tag, index, item.data()), 0)
            << tag->GetVarName() << ": " << driver_.GetLastErrorString();
        return item;
    }
    void expectItemsEqualTheWhole(const std::string& uri);
    void expectItemWriteEqualsTheWhole(const std::string& uri, const std::string& memory);

    FakeDriver driver_;
};

void ArrayItemTest::expectItemsEqualTheWhole(const std::string& uri) {
    const ITag* tag = driver_.tag(uri);
    Bytes whole(static_cast<std::size_t>(tag->GetVarLength()), kUntouched);
    if (driver_.Read(tag, whole.data()) == 0) return;
    for (int i = 0; i < ProtUtilsN::GetItemCount(tag); ++i)
        EXPECT_EQ(itemOf(tag, whole, i), readItem(tag, i)) << uri << " item " << i;
}

// The framework's own way, the whole array read and written, is the model.
void ArrayItemTest::expectItemWriteEqualsTheWhole(const std::string& uri,
                                                  const std::string& memory) {
    const ITag* tag = driver_.tag(uri);
    for (int i = 0; i < ProtUtilsN::GetItemCount(tag); ++i) {
        const FakeMemory before = driver_.memory(memory);
        driver_.setArrayItemByTag(0);
        const int expected = driver_.writeArrayItem(tag, i, newItem(tag, i).data());
        const FakeMemory wanted = driver_.memory(memory);
        driver_.memory(memory) = before;
        driver_.setArrayItemByTag(1);
        const int done = driver_.writeArrayItem(tag, i, newItem(tag, i).data());
        if (expected == 0) continue;
        ASSERT_NE(done, 0) << uri << " item " << i << ": " << driver_.GetLastErrorString();
        ASSERT_TRUE(driver_.memory(memory).image() == wanted.image()) << uri << " item " << i;
    }
}

}  // namespace

TEST_F(ArrayItemTest, ReadEqualsTheWholeReadInRegisters) {
    for (const char* memory : {"REG", "LONG", "BYTE"}) {
        for (const std::string& type : arrays())
            expectItemsEqualTheWhole(std::string("1?") + memory + "?300.5?" + type);
    }
}

TEST_F(ArrayItemTest, ReadEqualsTheWholeReadInBitMemories) {
    for (const char* type : {"boolean-1", "boolean-9", "boolean-40", "boolean-40(swap2)",
                             "boolean-40(swap8)", "boolean-9(inv)"}) {
        for (const char* offset : {"0", "3", "13"})
            expectItemsEqualTheWhole(std::string("1?COIL?") + offset + "?" + type);
    }
}

TEST_F(ArrayItemTest, WriteEqualsTheWholeWriteInRegisters) {
    for (const char* memory : {"REG", "LONG", "BYTE"}) {
        FakeMemory& area = driver_.memory(memory);
        area.setBytes(300, Bytes(1000, 0x11));  // decimal digits, so that "bcd" takes part
        for (const std::string& type : arrays()) {
            const FakeMemory before = area;
            expectItemWriteEqualsTheWhole(std::string("1?") + memory + "?300.5?" + type, memory);
            area = before;
        }
    }
}

TEST_F(ArrayItemTest, WriteEqualsTheWholeWriteInBitMemories) {
    for (const char* type : {"boolean-1", "boolean-9", "boolean-40", "boolean-40(swap2)",
                             "boolean-40(swap8)", "boolean-9(inv)"}) {
        for (const char* offset : {"0", "3", "13"})
            expectItemWriteEqualsTheWhole(std::string("1?COIL?") + offset + "?" + type, "COIL");
    }
}

TEST_F(ArrayItemTest, OnlyTheItemsOwnPartOfTheMemoryTravels) {
    struct Row {
        const char* uri;
        int index;
        const char* readCalls;
        const char* writeCalls;
    };
    constexpr Row kRows[] = {
        {"1?REG?100?short-50", 7, "read 107+1", "write 107+1"},
        {"1?REG?100?int-50", 7, "read 114+2", "write 114+2"},
        {"1?REG?100?double-500", 499, "read 2096+4", "write 2096+4"},
        {"1?REG?100?string-9", 8, "read 104+1", "read 104+1, write 104+1"},
        {"1?REG?100?byte-9", 3, "read 101+1", "read 101+1, write 101+1"},
        {"1?REG?100.3?boolean-40", 13, "read 101+1", "read 101+1, write 101+1"},
        {"1?REG?100?short-50(swap2)", 7, "read 107+1", "write 107+1"},
        {"1?REG?100?short-50(swap4)", 7, "read 106+2", "read 106+2, write 106+2"},
        {"1?REG?100?short-48(swap8)", 7, "read 104+4", "read 104+4, write 104+4"},
        {"1?LONG?100?short-9", 3, "read 101+1", "read 101+1, write 101+1"},
        {"1?LONG?100?float-9", 3, "read 103+1", "write 103+1"},
        {"1?COIL?100?boolean-40", 13, "readBits 113+1", "writeBits 113+1"},
        {"1?COIL?100?boolean-40(swap4)", 13, "readBits 112+4", "readBits 112+4, writeBits 112+4"},
    };
    for (const Row& row : kRows) {
        const ITag* tag = driver_.tag(row.uri);
        readItem(tag, row.index);
        EXPECT_EQ(row.readCalls, driver_.calls()) << row.uri;
        EXPECT_NE(driver_.writeArrayItem(tag, row.index, newItem(tag, 0).data()), 0) << row.uri;
        EXPECT_EQ(row.writeCalls, driver_.calls()) << row.uri;
    }
}

TEST_F(ArrayItemTest, NegationKeepsItsBoundOnBytes) {
    driver_.memory("REG").setBytes(0, Bytes(20, 0x01));
    const ITag* tag = driver_.tag("1?REG?0?short-10(neg)");
    EXPECT_EQ((Bytes{0xFF, 0xFE}), readItem(tag, 4));
    EXPECT_EQ((Bytes{0x01, 0x01}), readItem(tag, 5));
}

TEST_F(ArrayItemTest, NeighbourThatConvertsBadlyDoesNotMatter) {
    driver_.memory("REG").setBytes(0, {0x12, 0xFF, 0x34, 0xFF});
    const ITag* tag = driver_.tag("1?REG?0?unsignedByte-4(bcd)");
    EXPECT_EQ((Bytes{12}), readItem(tag, 0));
    const unsigned char value = 56;
    EXPECT_NE(driver_.writeArrayItem(tag, 2, &value), 0);
    EXPECT_EQ((Bytes{0x12, 0xFF, 0x56, 0xFF}), driver_.memory("REG").bytes(0, 4));
}

TEST_F(ArrayItemTest, BadConversionIsReported) {
    driver_.memory("REG").setBytes(0, {0x1A, 0x00, 0x12, 0x00});
    const ITag* bcd = driver_.tag("1?REG?0?short-2(bcd)");
    Bytes item(2, kUntouched);
    EXPECT_EQ(0, driver_.readArrayItem(bcd, 0, item.data()));
    EXPECT_EQ(-9, driver_.GetLastError());
    EXPECT_STREQ("read conversion error", driver_.GetLastErrorString());
    EXPECT_EQ(Bytes(2, kUntouched), item);

    const unsigned char tooLarge[] = {0xFF, 0xFF};
    EXPECT_EQ(0, driver_.writeArrayItem(bcd, 1, tooLarge));
    EXPECT_EQ(-9, driver_.GetLastError());
    EXPECT_STREQ("write conversion error", driver_.GetLastErrorString());

    const ITag* swapped = driver_.tag("1?REG?0?short-2(bcd,swap4)");
    EXPECT_EQ(0, driver_.writeArrayItem(swapped, 0, item.data()));
    EXPECT_STREQ("read conversion error", driver_.GetLastErrorString()) << "its partner is no BCD";
    EXPECT_EQ("read 0+1, read 0+2", driver_.calls());
}

TEST_F(ArrayItemTest, FailedReadWritesNothing) {
    const Bytes before = driver_.memory("REG").image();
    driver_.failCall(1);
    const unsigned char value = 1;
    EXPECT_EQ(0, driver_.writeArrayItem(driver_.tag("1?REG?0?byte-4"), 2, &value));
    EXPECT_EQ(-4, driver_.GetLastError());
    EXPECT_TRUE(driver_.memory("REG").image() == before);
    driver_.failCall(1);
    unsigned char item = kUntouched;
    EXPECT_EQ(0, driver_.readArrayItem(driver_.tag("1?REG?0?byte-4"), 2, &item));
    EXPECT_EQ(kUntouched, item);
}

TEST_F(ArrayItemTest, ScalarsAndStrangeItemsAreRefused) {
    struct Row {
        const char* uri;
        int index;
        const char* text;
    };
    constexpr Row kRows[] = {
        {"1?REG?0?short", 0, "accessing an array item where the tag is not array"},
        {"1?REG?0?short-4", -1, "accessing array item out of range"},
        {"1?REG?0?short-4", 4, "accessing array item out of range"},
        {"1?REG?0?short-0", 0, "accessing array item out of range"},
        {"1?REG?65535?short-2", 0, "Tag exceeds the memory area"},
        {"1?COIL?65535?boolean-2", 0, "Tag exceeds the memory area"},
        {"1?REG?0.-4?boolean-8", 5, "Tag's bit index is negative"},
    };
    for (const Row& row : kRows) {
        const ITag* tag = driver_.tag(row.uri);
        unsigned char item[2] = {kUntouched, kUntouched};
        EXPECT_EQ(0, driver_.readArrayItem(tag, row.index, item)) << row.uri;
        EXPECT_EQ(-1, driver_.GetLastError()) << row.uri;
        EXPECT_STREQ(row.text, driver_.GetLastErrorString()) << row.uri;
        EXPECT_EQ(kUntouched, item[0]) << row.uri;
        EXPECT_EQ(0, driver_.writeArrayItem(tag, row.index, item)) << row.uri;
        EXPECT_STREQ(row.text, driver_.GetLastErrorString()) << row.uri;
    }
    EXPECT_EQ("", driver_.calls());
}

TEST_F(ArrayItemTest, ReadOnlyMemoryIsReadButNotWritten) {
    const ITag* tag = driver_.tag("1?IREG?50?short-4");
    EXPECT_EQ(driver_.memory("IREG").bytes(51, 2), readItem(tag, 1));
    const unsigned char value[] = {1, 2};
    EXPECT_EQ(0, driver_.writeArrayItem(tag, 1, value));
    EXPECT_EQ(-1, driver_.GetLastError());
    EXPECT_STREQ("Memory type is read only", driver_.GetLastErrorString());
    EXPECT_EQ("read 51+1", driver_.calls());
}

TEST_F(ArrayItemTest, WholeArrayTravelsUnlessTheDriverAddressesItems) {
    driver_.setArrayItemByTag(0);
    const ITag* tag = driver_.tag("1?REG?50?short-4");
    EXPECT_EQ(driver_.memory("REG").bytes(51, 2), readItem(tag, 1));
    EXPECT_EQ("read 50+4", driver_.calls());
    const unsigned char value[] = {1, 2};
    EXPECT_NE(driver_.writeArrayItem(tag, 1, value), 0);
    EXPECT_EQ("read 50+4, write 50+4", driver_.calls());
}

TEST_F(ArrayItemTest, AreaOfTheDriverItselfTravelsWhole) {
    const ITag* tag = driver_.tag("1?AREA?0?unsignedByte-4");
    EXPECT_EQ(Bytes(1, driver_.memory("AREA").image()[2]), readItem(tag, 2));
    EXPECT_EQ("read 0+1", driver_.calls());
}
