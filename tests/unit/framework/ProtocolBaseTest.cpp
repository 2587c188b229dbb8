// Identity, error state and ownership of tags.
#include "framework/ProtocolBase.h"

#include <gtest/gtest.h>

#include <string>

#include "tests/unit/framework/TestProtocol.h"

namespace {

TEST(ProtocolBaseTest, EveryGenerationOfTheFamilyIsTheSameObject) {
    TestProtocol protocol;
    for (const char* face : {"ProtocolBase", "IProtocol7", "IProtocol6", "IProtocol5", "IProtocol4",
                             "IProtocol3", "IProtocol2", "IProtocol"}) {
        EXPECT_EQ(&protocol, protocol.ConvertTo(face)) << face;
    }
}

TEST(ProtocolBaseTest, OtherNamesConvertToNothing) {
    TestProtocol protocol;
    for (const char* face : {"IProtocol1", "IProtocol8", "iprotocol", "IProtocol ", " IProtocol",
                             "IInterface", "ProtgenProtocol", "TestProtocol", ""}) {
        EXPECT_EQ(nullptr, protocol.ConvertTo(face)) << '"' << face << '"';
    }
    EXPECT_EQ(nullptr, protocol.ConvertTo(nullptr));
}

TEST(ProtocolBaseTest, IdentIsTheProtocolNameUntilOneIsSet) {
    TestProtocol protocol;
    EXPECT_STREQ("TEST", protocol.GetIdent());
    protocol.SetIdent("line 2");
    EXPECT_STREQ("line 2", protocol.GetIdent());
    protocol.SetIdent("");
    EXPECT_STREQ("TEST", protocol.GetIdent());
}

TEST(ProtocolBaseTest, IdentIsACopyAndANullOneIsEmpty) {
    TestProtocol protocol;
    std::string ident = "panel";
    protocol.SetIdent(ident.c_str());
    ident = "other";
    EXPECT_STREQ("panel", protocol.GetIdent());
    protocol.SetIdent(nullptr);
    EXPECT_STREQ("TEST", protocol.GetIdent());
}

TEST(ProtocolBaseTest, NextInstanceHasTheSameName) {
    TestProtocol protocol;
    protocol.SetIdent("line 2");
    EXPECT_STREQ("TEST", protocol.GetNextInstanceName());
}

TEST(ProtocolBaseTest, NewObjectHasCodeOneAndNoText) {
    const TestProtocol protocol;
    EXPECT_EQ(1, protocol.GetLastError());
    EXPECT_STREQ("", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, LastFailureReplacesTheOneBefore) {
    TestProtocol protocol;
    protocol.SetError(-4, "no response");
    protocol.SetError(-6, "bad reply");
    EXPECT_EQ(-6, protocol.GetLastError());
    EXPECT_STREQ("bad reply", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, SuccessLeavesTheLastFailureInPlace) {
    TestProtocol protocol;
    protocol.SetError(-4, "no response");
    const TestTag tag("1", bytesShape(1));
    unsigned char value = 0;
    ASSERT_NE(protocol.Read(&tag, &value), 0);
    EXPECT_EQ(-4, protocol.GetLastError());
    EXPECT_STREQ("no response", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, TextIsACopyAndANullOneIsEmpty) {
    TestProtocol protocol;
    std::string text = "first";
    protocol.SetError(-1, text.c_str());
    text = "other";
    EXPECT_STREQ("first", protocol.GetLastErrorString());
    protocol.SetError(-3, nullptr);
    EXPECT_EQ(-3, protocol.GetLastError());
    EXPECT_STREQ("", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, OwnTextMayBeSetAgain) {
    TestProtocol protocol;
    protocol.SetError(-4, "no response");
    protocol.SetError(-6, protocol.GetLastErrorString());
    EXPECT_STREQ("no response", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, LongTextIsKeptWhole) {
    TestProtocol protocol;
    const std::string text(5000, 'x');
    protocol.SetError(-1, text.c_str());
    EXPECT_EQ(text, protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, TagErrorNamesTheUriAndTheTagsOwnText) {
    TestProtocol protocol;
    const TestTag tag("1?HREG?400001?nonsense", bytesShape(1));
    tag.SetError("unknown data type");
    protocol.SetError(-4, "no response");
    protocol.SetTagError(&tag);
    EXPECT_EQ(-1, protocol.GetLastError());
    EXPECT_STREQ("Tag URI error: 1?HREG?400001?nonsense - unknown data type",
                 protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, TagErrorOfATagWithoutUriLeavesItsPlaceEmpty) {
    TestProtocol protocol;
    TestTag tag("1", bytesShape(1));
    tag.forgetUri();
    tag.SetError("broken");
    protocol.SetTagError(&tag);
    EXPECT_STREQ("Tag URI error:  - broken", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, UnknownUriGivesNoTagAndTheDriversError) {
    TestProtocol protocol;
    EXPECT_EQ(nullptr, protocol.CreateTag("nowhere"));
    EXPECT_EQ(-1, protocol.GetLastError());
    EXPECT_STREQ("Tag URI error: no such tag", protocol.GetLastErrorString());
}

TEST(ProtocolBaseTest, FreedTagIsDestroyedOnceAndNotAgainWithTheObject) {
    int destroyed = 0;
    {
        TestProtocol protocol;
        protocol.knownTags["a"] = bytesShape(1);
        ITag* tag = protocol.CreateTag("a");
        ASSERT_NE(tag, nullptr);
        EXPECT_STREQ("a", tag->GetVarName());
        protocol.FreeTag(tag);
        destroyed = protocol.destroyedTags;
    }
    EXPECT_EQ(1, destroyed);
}

/// Counts into a place that outlives the protocol.
class OutlivedProtocol : public TestProtocol {
  public:
    explicit OutlivedProtocol(int* destroyed) : destroyed_(destroyed) {}
    ITag* CreateTagBase(const char* uri) override {
        return new TestTag(uri, bytesShape(1), destroyed_);
    }

  private:
    int* destroyed_;
};

TEST(ProtocolBaseTest, TagsStillHeldDieWithTheObjectEachOnce) {
    int destroyed = 0;
    {
        OutlivedProtocol protocol(&destroyed);
        ITag* first = protocol.CreateTag("a");
        protocol.CreateTag("b");
        protocol.CreateTag("c");
        protocol.FreeTag(first);
        EXPECT_EQ(1, destroyed);
    }
    EXPECT_EQ(3, destroyed);
}

TEST(ProtocolBaseTest, DeletedTagsAreDestroyedOnceAndTheObjectGoesOn) {
    int destroyed = 0;
    {
        OutlivedProtocol protocol(&destroyed);
        protocol.CreateTag("a");
        protocol.CreateTag("b");
        protocol.DeleteTags();
        EXPECT_EQ(2, destroyed);
        protocol.DeleteTags();
        EXPECT_EQ(2, destroyed);
        ASSERT_NE(protocol.CreateTag("c"), nullptr);
    }
    EXPECT_EQ(3, destroyed);
}

TEST(ProtocolBaseTest, TagsMayBeFreedAfterStopping) {
    int destroyed = 0;
    OutlivedProtocol protocol(&destroyed);
    ITag* tag = protocol.CreateTag("a");
    ASSERT_NE(protocol.Start(), 0);
    ASSERT_NE(protocol.Stop(), 0);
    EXPECT_EQ(0, destroyed);
    protocol.FreeTag(tag);
    EXPECT_EQ(1, destroyed);
}

TEST(ProtocolBaseTest, FreeingNothingIsHarmless) {
    int destroyed = 0;
    OutlivedProtocol protocol(&destroyed);
    protocol.CreateTag("a");
    protocol.FreeTag(nullptr);
    EXPECT_EQ(0, destroyed);
}

TEST(ProtocolBaseTest, CloneIsDestroyedByFreeTagWithoutTouchingTheOriginal) {
    int destroyed = 0;
    {
        OutlivedProtocol protocol(&destroyed);
        const ITag* tag = protocol.CreateTag("a");
        protocol.FreeTag(tag->Clone());
        EXPECT_EQ(1, destroyed);
    }
    EXPECT_EQ(2, destroyed);
}

}  // namespace
