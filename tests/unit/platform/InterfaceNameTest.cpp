#include <gtest/gtest.h>

#include "platform/IInterface.h"
#include "platform/IProtocolFactory.h"

namespace {

struct NamePair {
    const char* a;
    const char* b;
    bool same;
};

TEST(InterfaceNameTest, NamesAreEqualOnlyByteForByte) {
    const NamePair pairs[] = {
        {"IProtModule", "IProtModule", true},
        {"", "", true},
        {"IProtModule", "iprotmodule", false},
        {"IProtModule", "IProtModule ", false},
        {"IProtModule", " IProtModule", false},
        {"IProtocol", "IProtocol7", false},
        {"IProtocol7", "IProtocol", false},
        {"IProtocol", "", false},
        {nullptr, "IProtocol", false},
        {"IProtocol", nullptr, false},
        {nullptr, nullptr, false},
    };
    for (const NamePair& pair : pairs)
        EXPECT_EQ(pair.same, CompareInterface(pair.a, pair.b))
            << (pair.a ? pair.a : "null") << " and " << (pair.b ? pair.b : "null");
}

class BareProtocolFactory final : public IProtocolFactory {
  public:
    const char* GetImpName() const override { return "Bare"; }
    int GetImpVersion() const override { return 1; }
    IProtocol* CreateProtocol(const char*) override { return nullptr; }
    void DeleteProtocol(IProtocol*) override {}
};

TEST(InterfaceNameTest, ProtocolFactoryAnswersToItsInterfaceNameByDefault) {
    BareProtocolFactory factory;
    EXPECT_EQ(&factory, factory.ConvertTo("IProtocolFactory"));
    EXPECT_EQ(nullptr, factory.ConvertTo("ProtocolFactory"));
    EXPECT_EQ(nullptr, factory.ConvertTo("IInterface"));
}

}  // namespace
