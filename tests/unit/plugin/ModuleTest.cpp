// Taking the host's services and handing them back.
#include <gtest/gtest.h>

#include <new>

#include "framework/HostServicePointers.h"
#include "plugin/ProtModule.h"
#include "tests/support/FakeHost.h"

namespace {

using testing_support::FakeHost;

using Calls = std::vector<std::string>;

const Calls kTaken{"create IMultiTask2",      "create ISerialFactory", "create ISocketFactory",
                   "create ICDSBuffer",       "create IDiag",          "create IPermanentStorage",
                   "create IDriverInterface", "create ISmux",          "create IFastTimer"};

const Calls kHandedBack{"release IFastTimer",        "release ISmux",
                        "release IDriverInterface",  "release IDiag",
                        "release IPermanentStorage", "release IMultiTask2",
                        "release ISerialFactory",    "release ISocketFactory",
                        "release ICDSBuffer"};

Calls without(Calls calls, const std::string& call) {
    std::erase(calls, call);
    return calls;
}

class ModuleTest : public ::testing::Test {
  protected:
    FakeHost host;
    ProtModule module;
};

TEST_F(ModuleTest, InitTakesEveryServiceInOrder) {
    EXPECT_EQ(1, module.Init(&host));
    EXPECT_EQ(kTaken, host.calls());
    EXPECT_STREQ("", module.GetLastError());
    module.Close();
}

TEST_F(ModuleTest, ServicesLieInTheirPointers) {
    ASSERT_EQ(1, module.Init(&host));
    EXPECT_EQ(host.service("IMultiTask2"), piMultiTask);
    EXPECT_EQ(host.service("ISerialFactory"), piSerialFactory);
    EXPECT_EQ(host.service("ISocketFactory"), piSocketFactory);
    EXPECT_EQ(host.service("ICDSBuffer"), piCDSBuffer);
    EXPECT_EQ(host.service("IDiag"), piDiag);
    EXPECT_EQ(host.service("IPermanentStorage"), piPermanentStorage);
    EXPECT_EQ(host.service("IDriverInterface"), piDriverInterface);
    EXPECT_EQ(host.service("ISmux"), piSmux);
    EXPECT_EQ(host.service("IFastTimer"), piFastTimer);
    module.Close();
}

TEST_F(ModuleTest, CloseHandsOptionalServicesBackFirstAndClearsThePointers) {
    ASSERT_EQ(1, module.Init(&host));
    host.forget();
    module.Close();
    EXPECT_EQ(kHandedBack, host.calls());
    EXPECT_EQ(0, host.held());
    for (const IInterface* pointer :
         {piMultiTask, piSerialFactory, piSocketFactory, piCDSBuffer, piDiag, piPermanentStorage,
          piDriverInterface, piSmux, piFastTimer})
        EXPECT_EQ(nullptr, pointer);
}

TEST_F(ModuleTest, SecondInitOnlyCountsAndIgnoresItsArgument) {
    ASSERT_EQ(1, module.Init(&host));
    host.forget();
    FakeHost other;
    EXPECT_EQ(1, module.Init(&other));
    EXPECT_EQ(1, module.Init(nullptr));
    EXPECT_EQ(Calls{}, host.calls());
    EXPECT_EQ(Calls{}, other.calls());
    module.Close();
    module.Close();
    module.Close();
    EXPECT_EQ(kHandedBack, host.calls());
    EXPECT_EQ(Calls{}, other.calls());
}

TEST_F(ModuleTest, TwoInitsAndOneCloseKeepEveryService) {
    ASSERT_EQ(1, module.Init(&host));
    ASSERT_EQ(1, module.Init(&host));
    module.Close();
    EXPECT_EQ(9, host.held());
    EXPECT_EQ(host.service("IMultiTask2"), piMultiTask);
    module.Close();
    EXPECT_EQ(0, host.held());
}

TEST_F(ModuleTest, CloseWithoutInitDoesNothing) {
    module.Close();
    EXPECT_EQ(Calls{}, host.calls());
    ASSERT_EQ(1, module.Init(&host));
    module.Close();
    host.forget();
    module.Close();
    EXPECT_EQ(Calls{}, host.calls());
}

struct MissingService {
    const char* name;
    const char* text;
    Calls calls;
};

TEST_F(ModuleTest, MissingRequiredServiceGivesBackWhatWasTaken) {
    const MissingService cases[] = {
        {"IMultiTask2", "IMultiTask2 not created", {"create IMultiTask2"}},
        {"ISerialFactory",
         "ISerialFactory not created",
         {"create IMultiTask2", "create ISerialFactory", "release IMultiTask2"}},
        {"ISocketFactory",
         "ISocketFactory not created",
         {"create IMultiTask2", "create ISerialFactory", "create ISocketFactory",
          "release IMultiTask2", "release ISerialFactory"}},
        {"ICDSBuffer",
         "piCDSBuffer not created",
         {"create IMultiTask2", "create ISerialFactory", "create ISocketFactory",
          "create ICDSBuffer", "release IMultiTask2", "release ISerialFactory",
          "release ISocketFactory"}},
    };
    for (const MissingService& missing : cases) {
        FakeHost poor;
        ProtModule fresh;
        poor.withhold(missing.name);
        EXPECT_EQ(0, fresh.Init(&poor)) << missing.name;
        EXPECT_STREQ(missing.text, fresh.GetLastError());
        EXPECT_EQ(missing.calls, poor.calls()) << missing.name;
        EXPECT_EQ(0, poor.held()) << missing.name;

        poor.forget();
        fresh.Close();
        EXPECT_EQ(Calls{}, poor.calls()) << "the count is still 0 without " << missing.name;
    }
}

TEST_F(ModuleTest, PointersOfServicesHandedBackStayStaleUntilTheNextInit) {
    host.withhold("ISocketFactory");
    ASSERT_EQ(0, module.Init(&host));
    EXPECT_EQ(host.service("IMultiTask2"), piMultiTask);
    EXPECT_EQ(host.service("ISerialFactory"), piSerialFactory);
    EXPECT_EQ(nullptr, piSocketFactory);

    FakeHost complete;
    ASSERT_EQ(1, module.Init(&complete));
    EXPECT_EQ(complete.service("IMultiTask2"), piMultiTask);
    module.Close();
}

TEST_F(ModuleTest, ErrorTextStaysAfterALaterSuccess) {
    host.withhold("ISerialFactory");
    ASSERT_EQ(0, module.Init(&host));
    host.offerAgain("ISerialFactory");
    ASSERT_EQ(1, module.Init(&host));
    EXPECT_STREQ("ISerialFactory not created", module.GetLastError());
    module.Close();
}

TEST_F(ModuleTest, MissingOptionalServicesAreNoError) {
    const std::pair<const char*, IInterface**> optional[] = {
        {"IDiag", &piDiag},
        {"IPermanentStorage", &piPermanentStorage},
        {"IDriverInterface", &piDriverInterface},
        {"ISmux", &piSmux},
        {"IFastTimer", &piFastTimer},
    };
    for (const auto& [name, pointer] : optional) {
        FakeHost poor;
        ProtModule fresh;
        poor.withhold(name);
        EXPECT_EQ(1, fresh.Init(&poor)) << name;
        EXPECT_EQ(nullptr, *pointer) << name;
        EXPECT_STREQ("", fresh.GetLastError()) << name;
        EXPECT_EQ(kTaken, poor.calls()) << name;
        poor.forget();
        fresh.Close();
        EXPECT_EQ(without(kHandedBack, std::string("release ") + name), poor.calls());
    }
}

TEST_F(ModuleTest, DestructorClosesOnce) {
    {
        ProtModule forgotten;
        ASSERT_EQ(1, forgotten.Init(&host));
        host.forget();
    }
    EXPECT_EQ(kHandedBack, host.calls());
}

TEST_F(ModuleTest, DestructorOfAModuleBoundTwiceOnlyCounts) {
    {
        ProtModule forgotten;
        ASSERT_EQ(1, forgotten.Init(&host));
        ASSERT_EQ(1, forgotten.Init(&host));
        host.forget();
    }
    EXPECT_EQ(Calls{}, host.calls());
}

TEST_F(ModuleTest, DestructorOfAnUnboundModuleDoesNothing) {
    { const ProtModule unused; }
    EXPECT_EQ(Calls{}, host.calls());
}

}  // namespace
