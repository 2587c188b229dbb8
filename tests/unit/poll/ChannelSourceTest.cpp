// Whole blocks through the loaded driver: every tag gets the value that it has when it is read
// alone.
#include <gtest/gtest.h>

#include <numeric>

#include "poll/BlockReader.h"
#include "tests/unit/poll/LoadedDriver.h"

namespace {

using poll::Block;
using poll::ChannelSource;
using poll::TagReading;
using poll_test::LoadedDriver;

class ChannelSourceTest : public testing::Test {
  protected:
    /// A block of all the tags, in their order.
    static Block block(std::size_t tags, long items, int itemBytes) {
        Block made;
        made.bits = itemBytes == 0;
        made.itemBytes = itemBytes;
        made.items = items;
        made.tags.resize(tags);
        std::iota(made.tags.begin(), made.tags.end(), std::size_t{0});
        return made;
    }

    /// Reads the tags as one block and compares each with what it is alone.
    void expectBlock(const std::vector<std::string>& uris, long items, int itemBytes,
                     int requests = 1) {
        const std::vector<const ITag*> tags = driver_.tags(uris);
        ChannelSource source(driver_.channel(), tags);
        const int before = driver_.port().requests();
        const auto readings = source.read(block(tags.size(), items, itemBytes));
        EXPECT_EQ(requests, driver_.port().requests() - before);
        ASSERT_EQ(tags.size(), readings.size());
        for (std::size_t index = 0; index < tags.size(); ++index) {
            EXPECT_TRUE(readings[index].good) << uris[index] << readings[index].error.text;
            EXPECT_EQ(driver_.channel().read(*tags[index]).value(), readings[index].value)
                << uris[index];
        }
    }

    LoadedDriver driver_;
};

TEST_F(ChannelSourceTest, RegistersOfAllTypesComeOutOfOneRequest) {
    expectBlock(
        {"1?HREG?400010?unsignedShort", "1?HREG?400010?int", "1?HREG?400012?float",
         "1?HREG?400014?double(swap2)", "1?HREG?400018?unsignedByte", "1?HREG?400019?string-5",
         "1?HREG?400022?short-7", "1?HREG?400024?int64", "1?HREG?400031?binary-3"},
        23, 2);
}

TEST_F(ChannelSourceTest, BitsInsideRegistersAreFoundAtTheirSubIndex) {
    expectBlock(
        {"1?IREG?300010.15?boolean", "1?IREG?300010.0?boolean", "1?IREG?300010.3?boolean-20",
         "1?IREG?300010.37?boolean", "1?IREG?300011.7?boolean", "1?IREG?300012.8?boolean-9"},
        4, 2);
}

TEST_F(ChannelSourceTest, WideRegistersAreCountedByTheirWidth) {
    expectBlock({"3?LONG?5000?unsignedInt", "3?LONG?5001?float", "3?LONG?5001?int-3",
                 "3?LONG?5007?unsignedInt"},
                8, 4);
}

TEST_F(ChannelSourceTest, BitBlockMayBeginAtEveryBitOfAByte) {
    for (int first = 1; first <= 17; ++first) {
        const auto uri = [first](int shift, const char* type) {
            return "1?OUTP?" + std::to_string(first + shift) + "?" + type;
        };
        expectBlock({uri(0, "boolean"), uri(0, "boolean-9"), uri(7, "boolean"), uri(8, "boolean-3"),
                     uri(30, "boolean-11")},
                    41, 0);
    }
}

TEST_F(ChannelSourceTest, TagWiderThanARequestIsReadWhole) {
    expectBlock({"1?HREG?400001?unsignedShort-300"}, 300, 2, 3);
    expectBlock({"1?INP?100003?boolean-4100"}, 4100, 0, 3);
}

TEST_F(ChannelSourceTest, NarrowTagInsideATooWideOneComesAlong) {
    expectBlock({"1?HREG?400001?unsignedShort-300", "1?HREG?400200?float"}, 300, 2, 3);
}

TEST_F(ChannelSourceTest, AreasOfTheDriverItselfAreReadWithoutTraffic) {
    expectBlock({"1?SP_Baud?0?unsignedInt"}, 1, 4, 0);
    expectBlock({"1?NO?0?unsignedByte"}, 1, 1, 0);
}

TEST_F(ChannelSourceTest, SilentSlaveGivesEveryTagTheDriversErrorAndNoValue) {
    const auto tags = driver_.tags({"1?HREG?400001?short", "1?HREG?400005?short"});
    ChannelSource source(driver_.channel(), tags);
    driver_.port().fallSilent();
    for (const TagReading& reading : source.read(block(2, 5, 2))) {
        EXPECT_FALSE(reading.good);
        EXPECT_EQ((poll::ReadError{-4, driver_.channel().lastError().text}), reading.error);
        EXPECT_TRUE(reading.value.empty());
    }
}

TEST_F(ChannelSourceTest, RefusedConversionSpoilsItsOwnTagAlone) {
    driver_.slave().set(1, sim::Area::HoldingRegister, 0, 0x12AB);
    driver_.slave().set(1, sim::Area::HoldingRegister, 1, 0x1234);
    const auto tags =
        driver_.tags({"1?HREG?400001?unsignedShort(bcd)", "1?HREG?400002?unsignedShort(bcd)"});
    ChannelSource source(driver_.channel(), tags);
    const auto readings = source.read(block(2, 2, 2));
    ASSERT_EQ(2U, readings.size());
    EXPECT_FALSE(readings[0].good);
    EXPECT_TRUE(readings[1].good);
    ASSERT_FALSE(driver_.channel().read(*tags[0]).ok());
    EXPECT_EQ(driver_.channel().lastError().text, readings[0].error.text);
    EXPECT_EQ(driver_.channel().lastError().code, readings[0].error.code);
}

TEST_F(ChannelSourceTest, TagOutsideItsBlockIsNotRead) {
    const auto tags = driver_.tags(
        {"1?HREG?400010?short", "1?HREG?400009?short", "1?HREG?400012?short", "1?HREG?400011?int"});
    ChannelSource source(driver_.channel(), tags);
    const auto readings = source.read(block(4, 2, 2));
    ASSERT_EQ(4U, readings.size());
    EXPECT_TRUE(readings[0].good);
    for (std::size_t outside = 1; outside < 4; ++outside)
        EXPECT_EQ(-1, readings[outside].error.code) << outside;
}

TEST_F(ChannelSourceTest, WritesAreTheDriversWithItsErrors) {
    ChannelSource source(driver_.channel(), driver_.tags({"1?HREG?400001?unsignedShort"}));
    const std::uint8_t value[] = {0x34, 0x12};
    EXPECT_EQ(std::nullopt, source.write(0, value));
    EXPECT_EQ(0x1234U, driver_.slave().get(1, sim::Area::HoldingRegister, 0));
    driver_.port().fallSilent();
    const auto refused = source.write(0, value);
    ASSERT_TRUE(refused);
    EXPECT_EQ(-4, refused->code);
}

TEST_F(ChannelSourceTest, ProbeLimitsThePortsWaitWhileItLasts) {
    std::vector<std::chrono::milliseconds> limits;
    ChannelSource source(
        driver_.channel(), driver_.tags({"1?HREG?400001?short"}),
        {.gone = {}, .whyNotOpen = {}, .limitWait = [&](std::chrono::milliseconds wait) {
             limits.push_back(wait);
         }});
    EXPECT_TRUE(source.probe(block(1, 1, 2), std::chrono::milliseconds{40}).front().good);
    EXPECT_EQ((std::vector{std::chrono::milliseconds{40}, std::chrono::milliseconds{0}}), limits);
}

TEST_F(ChannelSourceTest, ClosedLineReadsNothingUntilItIsOpenedAgain) {
    ChannelSource source(driver_.channel(), driver_.tags({"1?HREG?400001?short"}));
    const Block one = block(1, 1, 2);
    source.close();
    EXPECT_EQ(-3, source.read(one).front().error.code);
    EXPECT_TRUE(source.open());
    EXPECT_TRUE(source.open()) << "open already";
    EXPECT_TRUE(source.read(one).front().good);
}

}  // namespace
