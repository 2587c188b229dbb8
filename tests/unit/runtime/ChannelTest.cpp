#include "runtime/Channel.h"

#include <gmock/gmock.h>

#include "tests/unit/runtime/FakePluginHost.h"

namespace {

using ::testing::ElementsAre;
using namespace runtime;

class ChannelTest : public ::testing::Test {
  protected:
    ChannelTest()
        : module_(Module::bind(PluginLibrary::load(fakePlugin("works_plugin.so")).value(),
                               host_.services)
                      .value()),
          channel_(module_.createProtocol("FAKE").value()) {}

    FakeHost host_;
    Module module_;
    Channel channel_;
};

TEST_F(ChannelTest, RefusedConfigurationCarriesCodeAndText) {
    const auto done = channel_.configure("bad");
    ASSERT_FALSE(done);
    EXPECT_EQ(-1, done.error().code);
    EXPECT_EQ("bad configuration", done.error().text);
    EXPECT_TRUE(channel_.configure("good"));
}

TEST_F(ChannelTest, RefusedTagCarriesCodeAndText) {
    const auto tag = channel_.createTag("bad");
    ASSERT_FALSE(tag);
    EXPECT_EQ("bad tag", tag.error().text);
}

TEST_F(ChannelTest, ReadBeforeStartFails) {
    const auto tag = channel_.createTag("tag");
    ASSERT_TRUE(tag);
    const auto value = channel_.read(*tag.value());
    ASSERT_FALSE(value);
    EXPECT_EQ(-3, value.error().code);
    channel_.freeTag(tag.value());
}

TEST_F(ChannelTest, ReadsBackWhatWasWritten) {
    const auto tag = channel_.createTag("tag");
    ASSERT_TRUE(tag);
    ASSERT_TRUE(channel_.start());
    const std::uint8_t written[] = {0x12, 0x34};
    ASSERT_TRUE(channel_.write(*tag.value(), written));
    const auto value = channel_.read(*tag.value());
    ASSERT_TRUE(value);
    EXPECT_THAT(value.value(), ElementsAre(0x12, 0x34));
    channel_.freeTag(tag.value());
}

TEST_F(ChannelTest, ValueOfWrongSizeNeverReachesTheDriver) {
    const auto tag = channel_.createTag("tag");
    ASSERT_TRUE(tag);
    ASSERT_TRUE(channel_.start());
    const std::uint8_t tooLong[] = {9, 9, 9};
    const auto done = channel_.write(*tag.value(), tooLong);
    ASSERT_FALSE(done);
    EXPECT_EQ(-1, done.error().code);
    EXPECT_EQ("the value has 3 bytes, the tag takes 2", done.error().text);
    EXPECT_THAT(channel_.read(*tag.value()).value(), ElementsAre(0, 0));
    channel_.freeTag(tag.value());
}

TEST_F(ChannelTest, AnswerThatFillsTheBufferNeedsNoTerminator) {
    EXPECT_EQ("0123", channel_.command("count", 4));
    EXPECT_EQ("0123456789", channel_.command("count", 64));
}

TEST_F(ChannelTest, UnknownCommandHasNoAnswer) {
    EXPECT_EQ(std::nullopt, channel_.command("what"));
}

TEST_F(ChannelTest, DriverOfEarlierGenerationReportsNoParameters) {
    EXPECT_EQ(std::nullopt, channel_.communicationParameters());
}

TEST_F(ChannelTest, StopEndsReading) {
    const auto tag = channel_.createTag("tag");
    ASSERT_TRUE(tag);
    ASSERT_TRUE(channel_.start());
    EXPECT_TRUE(channel_.started());
    channel_.stop();
    EXPECT_FALSE(channel_.started());
    EXPECT_FALSE(channel_.read(*tag.value()));
    channel_.freeTag(tag.value());
}

TEST_F(ChannelTest, IdentReachesTheDriver) {
    channel_.setIdent("line 1");
    EXPECT_STREQ("line 1", channel_.protocol().GetIdent());
}

}  // namespace
