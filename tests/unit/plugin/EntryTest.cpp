// The entry and the objects behind it.
#include <gtest/gtest.h>

#include "platform/IProtModule.h"
#include "plugin/ProtFactory.h"

namespace {

IInterface* create(const char* name) {
    return GetInterfaceFactory()->CreateInterface(name);
}

TEST(EntryTest, TheFactoryIsOneStaticObject) {
    ASSERT_NE(nullptr, GetInterfaceFactory());
    EXPECT_EQ(GetInterfaceFactory(), GetInterfaceFactory());
}

TEST(EntryTest, BothObjectsAnswerToInterfaceAndClassName) {
    ASSERT_NE(nullptr, create("IProtocolFactory"));
    ASSERT_NE(nullptr, create("IProtModule"));
    EXPECT_EQ(create("IProtocolFactory"), create("ProtocolFactory"));
    EXPECT_EQ(create("IProtModule"), create("ProtModule"));
    EXPECT_NE(create("IProtModule"), create("IProtocolFactory"));
    EXPECT_EQ(create("IProtModule"), create("IProtModule")) << "not a new object each time";
}

TEST(EntryTest, OtherNamesGiveNull) {
    for (const char* name : {"iprotmodule", "IPROTMODULE", "IProtModule ", " IProtModule",
                             "IProtModul", "IProtModule2", "", "IInterfaceFactory",
                             "InterfaceFactory", "IInterface", "IProtocol", "Protocol_MRTU"})
        EXPECT_EQ(nullptr, create(name)) << '"' << name << '"';
}

TEST(EntryTest, ReleaseDoesNothing) {
    IInterface* module = create("IProtModule");
    GetInterfaceFactory()->ReleaseInterface(module);
    GetInterfaceFactory()->ReleaseInterface(module);
    GetInterfaceFactory()->ReleaseInterface(nullptr);
    EXPECT_STREQ("ProtModule", module->GetImpName());
    EXPECT_EQ(module, create("IProtModule"));
}

struct Identity {
    const char* created;
    const char* impName;
    int impVersion;
    std::vector<const char*> answersTo;
    std::vector<const char*> refuses;
};

TEST(EntryTest, IdentitiesAndConversions) {
    const Identity identities[] = {
        {"IProtocolFactory",
         "ProtFactoryInDLL",
         100,
         {"ProtocolFactory", "IProtocolFactory"},
         {"ProtFactoryInDLL", "iprotocolfactory", "IProtocolFactory ", "IInterface", "ProtModule",
          ""}},
        {"IProtModule",
         "ProtModule",
         100,
         {"ProtModule", "IProtModule"},
         {"protmodule", "IProtModule ", "IInterface", "IProtocolFactory", ""}},
    };
    for (const Identity& identity : identities) {
        IInterface* object = create(identity.created);
        ASSERT_NE(nullptr, object) << identity.created;
        EXPECT_STREQ(identity.impName, object->GetImpName());
        EXPECT_EQ(identity.impVersion, object->GetImpVersion());
        for (const char* name : identity.answersTo)
            EXPECT_EQ(object, object->ConvertTo(name)) << identity.created << " as " << name;
        for (const char* name : identity.refuses)
            EXPECT_EQ(nullptr, object->ConvertTo(name)) << identity.created << " as " << name;
    }
}

}  // namespace
