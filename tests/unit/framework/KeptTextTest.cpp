// A text that may be replaced under its readers.
#include "framework/KeptText.h"

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <thread>

#include "tests/support/MemoryShortage.h"

namespace {

using testing_support::MemoryShortage;

TEST(KeptTextTest, ShowsACopyOfTheLastText) {
    KeptText text;
    EXPECT_STREQ("", text.get());
    std::string given = "first";
    EXPECT_TRUE(text.set(given));
    given = "other";
    EXPECT_STREQ("first", text.get());
    EXPECT_TRUE(text.set(""));
    EXPECT_STREQ("", text.get());
}

TEST(KeptTextTest, TextHandedOutOutlivesItsReplacement) {
    KeptText text;
    text.set("first");
    const char* handedOut = text.get();
    text.set("second");
    text.show("a lasting one");
    EXPECT_STREQ("first", handedOut);
    EXPECT_STREQ("a lasting one", text.get());
}

TEST(KeptTextTest, KnownTextNeedsNoMemory) {
    KeptText text;
    text.set("first");
    text.set("second");
    const MemoryShortage shortage;
    EXPECT_TRUE(text.set("first"));
    EXPECT_STREQ("first", text.get());
}

TEST(KeptTextTest, WithoutMemoryTheTextInForceStays) {
    KeptText text;
    text.set("first");
    const MemoryShortage shortage;
    EXPECT_FALSE(text.set("second"));
    EXPECT_STREQ("first", text.get());
}

TEST(KeptTextTest, CopyHasATextOfItsOwn) {
    KeptText text;
    text.set("first");
    const KeptText copy(text);
    text.set("second");
    EXPECT_STREQ("first", copy.get());
    EXPECT_NE(text.get(), copy.get());
}

TEST(KeptTextTest, ReadersNeverSeeATextInTheMaking) {
    KeptText text;
    text.set("aaaa");
    std::atomic<bool> done = false;
    std::atomic<int> torn = 0;
    std::thread reader([&] {
        while (!done) {
            const std::string seen = text.get();
            if (seen != "aaaa" && seen != "bbbbbbbb") ++torn;
        }
    });
    const auto change = [&text] {
        for (int round = 0; round < 5000; ++round)
            text.set(round % 2 == 0 ? "bbbbbbbb" : "aaaa");
    };
    std::thread one(change);
    std::thread other(change);
    one.join();
    other.join();
    done = true;
    reader.join();
    EXPECT_EQ(0, torn);
}

}  // namespace
