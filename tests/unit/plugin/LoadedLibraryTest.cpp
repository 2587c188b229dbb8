// Loading and unloading the plug-in file.
#include <gtest/gtest.h>

#include "tests/support/FakeHost.h"
#include "tests/unit/plugin/LoadedLibrary.h"

namespace {

using testing_support::FakeHost;

TEST(LoadedLibraryTest, EntryIsFoundByItsPlainName) {
    const LoadedLibrary library;
    ASSERT_TRUE(library.loaded());
    ASSERT_NE(nullptr, library.factory());
    EXPECT_STREQ("ProtModule", library.module()->GetImpName());
    EXPECT_STREQ("ProtFactoryInDLL", library.protocols()->GetImpName());
}

TEST(LoadedLibraryTest, ServicePointersAreNullUntilInit) {
    const LoadedLibrary library;
    ASSERT_TRUE(library.loaded());
    for (const char* name :
         {"piMultiTask", "piSerialFactory", "piSocketFactory", "piCDSBuffer", "piDiag",
          "piPermanentStorage", "piDriverInterface", "piSmux", "piFastTimer"}) {
        auto** pointer = static_cast<IInterface**>(library.symbol(name));
        ASSERT_NE(nullptr, pointer) << name << " is not exported";
        EXPECT_EQ(nullptr, *pointer) << name;
    }
}

TEST(LoadedLibraryTest, UnloadHandsTheServicesOfAForgetfulHostBack) {
    FakeHost host;
    LoadedLibrary library;
    ASSERT_TRUE(library.loaded());
    ASSERT_EQ(1, library.module()->Init(&host));
    EXPECT_EQ(9, host.held());
    library.unload();
    EXPECT_FALSE(LoadedLibrary::stillThere());
    EXPECT_EQ(0, host.held());
}

TEST(LoadedLibraryTest, UnloadAfterCloseTouchesTheHostNoMore) {
    FakeHost host;
    LoadedLibrary library;
    ASSERT_TRUE(library.loaded());
    ASSERT_EQ(1, library.module()->Init(&host));
    library.module()->Close();
    host.forget();
    library.unload();
    EXPECT_TRUE(host.calls().empty());
}

TEST(LoadedLibraryTest, StateIsFreshAfterEveryLoad) {
    for (int round = 0; round < 20; ++round) {
        FakeHost host;
        LoadedLibrary library;
        ASSERT_TRUE(library.loaded());
        host.withhold("ISocketFactory");
        EXPECT_STREQ("", library.module()->GetLastError()) << "round " << round;
        EXPECT_EQ(0, library.module()->Init(&host));
        EXPECT_STREQ("ISocketFactory not created", library.module()->GetLastError());
        host.offerAgain("ISocketFactory");
        EXPECT_EQ(1, library.module()->Init(&host));
        IProtocol* protocol = library.protocols()->CreateProtocol("MRTU");
        EXPECT_NE(nullptr, protocol);
        library.protocols()->DeleteProtocol(protocol);
        library.module()->Close();
        library.unload();
        EXPECT_FALSE(LoadedLibrary::stillThere());
    }
}

}  // namespace
