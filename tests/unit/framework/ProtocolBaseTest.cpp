// Identity, error state and ownership of tags.
#include "framework/ProtocolBase.h"

#include <gtest/gtest.h>

#include <string>

#include "tests/unit/framework/TestProtocol.h"

namespace {

TEST(ProtocolBaseIdentity, EveryGenerationOfTheFamilyIsTheSameObject) {
    TestProtocol protocol;
    for (const char* face : {"ProtocolBase", "IProtocol7", "IProtocol6", "IProtocol5", "IProtocol4",
                             "IProtocol3", "IProtocol2", "IProtocol"}) {
        EXPECT_EQ(protocol.ConvertTo(face), &protocol) << face;
    }
}

TEST(ProtocolBaseIdentity, OtherNamesConvertToNothing) {
    TestProtocol protocol;
    for (const char* face : {"IProtocol1", "IProtocol8", "iprotocol", "IProtocol ", " IProtocol",
                             "IInterface", "ProtgenProtocol", "TestProtocol", ""}) {
        EXPECT_EQ(protocol.ConvertTo(face), nullptr) << '"' << face << '"';
    }
    EXPECT_EQ(protocol.ConvertTo(nullptr), nullptr);
}

TEST(ProtocolBaseIdentity, IdentIsTheProtocolNameUntilOneIsSet) {
    TestProtocol protocol;
    EXPECT_STREQ(protocol.GetIdent(), "TEST");
    protocol.SetIdent("line 2");
    EXPECT_STREQ(protocol.GetIdent(), "line 2");
    protocol.SetIdent("");
    EXPECT_STREQ(protocol.GetIdent(), "TEST");
}

TEST(ProtocolBaseIdentity, IdentIsACopyAndANullOneIsEmpty) {
    TestProtocol protocol;
    std::string ident = "panel";
    protocol.SetIdent(ident.c_str());
    ident = "other";
    EXPECT_STREQ(protocol.GetIdent(), "panel");
    protocol.SetIdent(nullptr);
    EXPECT_STREQ(protocol.GetIdent(), "TEST");
}

TEST(ProtocolBaseIdentity, NextInstanceHasTheSameName) {
    TestProtocol protocol;
    protocol.SetIdent("line 2");
    EXPECT_STREQ(protocol.GetNextInstanceName(), "TEST");
}

TEST(ProtocolBaseErrors, NewObjectHasCodeOneAndNoText) {
    const TestProtocol protocol;
    EXPECT_EQ(protocol.GetLastError(), 1);
    EXPECT_STREQ(protocol.GetLastErrorString(), "");
}

TEST(ProtocolBaseErrors, LastFailureReplacesTheOneBefore) {
    TestProtocol protocol;
    protocol.SetError(-4, "no response");
    protocol.SetError(-6, "bad reply");
    EXPECT_EQ(protocol.GetLastError(), -6);
    EXPECT_STREQ(protocol.GetLastErrorString(), "bad reply");
}

TEST(ProtocolBaseErrors, SuccessLeavesTheLastFailureInPlace) {
    TestProtocol protocol;
    protocol.SetError(-4, "no response");
    const TestTag tag("1", bytesShape(1));
    unsigned char value = 0;
    ASSERT_NE(protocol.Read(&tag, &value), 0);
    EXPECT_EQ(protocol.GetLastError(), -4);
    EXPECT_STREQ(protocol.GetLastErrorString(), "no response");
}

TEST(ProtocolBaseErrors, TextIsACopyAndANullOneIsEmpty) {
    TestProtocol protocol;
    std::string text = "first";
    protocol.SetError(-1, text.c_str());
    text = "other";
    EXPECT_STREQ(protocol.GetLastErrorString(), "first");
    protocol.SetError(-3, nullptr);
    EXPECT_EQ(protocol.GetLastError(), -3);
    EXPECT_STREQ(protocol.GetLastErrorString(), "");
}

TEST(ProtocolBaseErrors, OwnTextMayBeSetAgain) {
    TestProtocol protocol;
    protocol.SetError(-4, "no response");
    protocol.SetError(-6, protocol.GetLastErrorString());
    EXPECT_STREQ(protocol.GetLastErrorString(), "no response");
}

TEST(ProtocolBaseErrors, LongTextIsKeptWhole) {
    TestProtocol protocol;
    const std::string text(5000, 'x');
    protocol.SetError(-1, text.c_str());
    EXPECT_EQ(protocol.GetLastErrorString(), text);
}

TEST(ProtocolBaseErrors, TagErrorNamesTheUriAndTheTagsOwnText) {
    TestProtocol protocol;
    const TestTag tag("1?HREG?400001?nonsense", bytesShape(1));
    tag.SetError("unknown data type");
    protocol.SetError(-4, "no response");
    protocol.SetTagError(&tag);
    EXPECT_EQ(protocol.GetLastError(), -1);
    EXPECT_STREQ(protocol.GetLastErrorString(),
                 "Tag URI error: 1?HREG?400001?nonsense - unknown data type");
}

TEST(ProtocolBaseErrors, TagErrorOfATagWithoutUriLeavesItsPlaceEmpty) {
    TestProtocol protocol;
    TestTag tag("1", bytesShape(1));
    tag.forgetUri();
    tag.SetError("broken");
    protocol.SetTagError(&tag);
    EXPECT_STREQ(protocol.GetLastErrorString(), "Tag URI error:  - broken");
}

TEST(ProtocolBaseTags, UnknownUriGivesNoTagAndTheDriversError) {
    TestProtocol protocol;
    EXPECT_EQ(protocol.CreateTag("nowhere"), nullptr);
    EXPECT_EQ(protocol.GetLastError(), -1);
    EXPECT_STREQ(protocol.GetLastErrorString(), "Tag URI error: no such tag");
}

TEST(ProtocolBaseTags, FreedTagIsDestroyedOnceAndNotAgainWithTheObject) {
    int destroyed = 0;
    {
        TestProtocol protocol;
        protocol.knownTags["a"] = bytesShape(1);
        ITag* tag = protocol.CreateTag("a");
        ASSERT_NE(tag, nullptr);
        EXPECT_STREQ(tag->GetVarName(), "a");
        protocol.FreeTag(tag);
        destroyed = protocol.destroyedTags;
    }
    EXPECT_EQ(destroyed, 1);
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

TEST(ProtocolBaseTags, TagsStillHeldDieWithTheObjectEachOnce) {
    int destroyed = 0;
    {
        OutlivedProtocol protocol(&destroyed);
        ITag* first = protocol.CreateTag("a");
        protocol.CreateTag("b");
        protocol.CreateTag("c");
        protocol.FreeTag(first);
        EXPECT_EQ(destroyed, 1);
    }
    EXPECT_EQ(destroyed, 3);
}

TEST(ProtocolBaseTags, DeletedTagsAreDestroyedOnceAndTheObjectGoesOn) {
    int destroyed = 0;
    {
        OutlivedProtocol protocol(&destroyed);
        protocol.CreateTag("a");
        protocol.CreateTag("b");
        protocol.DeleteTags();
        EXPECT_EQ(destroyed, 2);
        protocol.DeleteTags();
        EXPECT_EQ(destroyed, 2);
        ASSERT_NE(protocol.CreateTag("c"), nullptr);
    }
    EXPECT_EQ(destroyed, 3);
}

TEST(ProtocolBaseTags, TagsMayBeFreedAfterStopping) {
    int destroyed = 0;
    OutlivedProtocol protocol(&destroyed);
    ITag* tag = protocol.CreateTag("a");
    ASSERT_NE(protocol.Start(), 0);
    ASSERT_NE(protocol.Stop(), 0);
    EXPECT_EQ(destroyed, 0);
    protocol.FreeTag(tag);
    EXPECT_EQ(destroyed, 1);
}

TEST(ProtocolBaseTags, FreeingNothingIsHarmless) {
    int destroyed = 0;
    OutlivedProtocol protocol(&destroyed);
    protocol.CreateTag("a");
    protocol.FreeTag(nullptr);
    EXPECT_EQ(destroyed, 0);
}

TEST(ProtocolBaseTags, CloneIsDestroyedByFreeTagWithoutTouchingTheOriginal) {
    int destroyed = 0;
    {
        OutlivedProtocol protocol(&destroyed);
        const ITag* tag = protocol.CreateTag("a");
        protocol.FreeTag(tag->Clone());
        EXPECT_EQ(destroyed, 1);
    }
    EXPECT_EQ(destroyed, 2);
}

}  // namespace
