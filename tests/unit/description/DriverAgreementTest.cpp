// The description against a protocol object, seen as a host sees it.
#include <gtest/gtest.h>

#include <cstring>
#include <memory>

#include "description/GetXml.h"
#include "framework/DataTypes.h"
#include "mrtu/Tag_MRTU.h"
#include "platform/IProtModule.h"
#include "platform/IProtocol.h"
#include "plugin/ProtFactory.h"
#include "tests/support/FakeHost.h"
#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

class DriverAgreementTest : public testing::Test {
  protected:
    void SetUp() override {
        module_ = static_cast<IProtModule*>(plugin_.CreateInterface("IProtModule"));
        ASSERT_EQ(1, module_->Init(&host_));
        factory_ = static_cast<IProtocolFactory*>(plugin_.CreateInterface("IProtocolFactory"));
        protocol_ = factory_->CreateProtocol("MRTU");
        ASSERT_NE(protocol_, nullptr);
    }
    void TearDown() override {
        factory_->DeleteProtocol(protocol_);
        module_->Close();
    }

    IProtocol& protocol() { return *protocol_; }
    IProtocol7& protocol7() {
        return *static_cast<IProtocol7*>(protocol_->ConvertTo("IProtocol7"));
    }

    void configure(const std::string& items) {
        const std::string text =
            "CfgVer=1 " + items +
            " defNodeId=1 txMode=RTU uart=com1 baudrate=9600 parity=even stopbits=1 mode=RS-485";
        ASSERT_TRUE(protocol_->Config(text.c_str())) << protocol_->GetLastErrorString();
    }

    bool acceptsTag(const std::string& uri) {
        ITag* tag = protocol_->CreateTag(uri.c_str());
        if (tag != nullptr) protocol_->FreeTag(tag);
        return tag != nullptr;
    }

    int writeFunctionOf(const std::string& uri) {
        ITag* tag = protocol_->CreateTag(uri.c_str());
        const auto* ours = dynamic_cast<Tag_MRTU*>(tag);
        const int function = ours != nullptr ? ours->writeFunction() : -1;
        if (tag != nullptr) protocol_->FreeTag(tag);
        return function;
    }

  private:
    testing_support::FakeHost host_;
    IInterfaceFactory& plugin_ = *GetInterfaceFactory();
    IProtModule* module_ = nullptr;
    IProtocolFactory* factory_ = nullptr;
    IProtocol* protocol_ = nullptr;
};

std::string fact(const char* element) {
    return root().child(element).child_value();
}

TEST_F(DriverAgreementTest, ProtocolHandsOutTheBlock) {
    EXPECT_EQ(GetXml_MRTU(), protocol().GetXml());
}

TEST_F(DriverAgreementTest, AgreeOnNamesAndNumbers) {
    EXPECT_EQ(protocol().GetName(), fact("name"));
    EXPECT_EQ(protocol().GetProtocolName(), fact("display"));
    EXPECT_EQ(std::to_string(protocol().GetProtocolType()), fact("code"));
    const std::string version = "Version=" + std::to_string(protocol().GetProtocolVersion()) + "?";
    const std::string markerTail = version + "Platform=KV58_LIN";
    const char* lengthLine = reinterpret_cast<const char*>(GetXml_MRTU());
    EXPECT_EQ(markerTail, std::string(lengthLine - markerTail.size() - 1, markerTail.size()));
}

TEST_F(DriverAgreementTest, AgreeOnTheFieldsOfATagUri) {
    std::vector<std::string> names;
    names.reserve(4);
    for (int i = 0; i < protocol7().getTagUriFieldCount(); ++i) {
        names.emplace_back(protocol7().getTagUriFieldName(i));
    }
    EXPECT_EQ(names, childTexts(root().child("tag_uri")));
}

TEST_F(DriverAgreementTest, AgreeThatThereAreNoMultipleReadsAndWrites) {
    auto* later = static_cast<IProtocol3*>(protocol().ConvertTo("IProtocol3"));
    ASSERT_NE(later, nullptr);
    EXPECT_EQ(later->MultipleReadSupported(), fact("canMultipleRead") == "true");
    EXPECT_EQ(later->MultipleWriteSupported(), fact("canMultipleWrite") == "true");
}

TEST_F(DriverAgreementTest, ConsoleShowsTheLengthLine) {
    auto* console = static_cast<IProtocol2*>(protocol().ConvertTo("IProtocol2"));
    ASSERT_NE(console, nullptr);
    char answer[64];
    std::memset(answer, 'x', sizeof answer);
    EXPECT_EQ(1, console->DoCommand("xml", answer, sizeof answer));
    EXPECT_STREQ("compressedXML=2224", answer);
    EXPECT_EQ('\0', answer[sizeof answer - 1]) << "padded to the end";
}

/// A data type that the area admits, as a tag URI writes it.
std::string admittedType(const std::string& area) {
    const unsigned mask =
        childWithText(root().child("memtypes"), area).attribute("icomTypes").as_uint();
    for (const ProtUtilsN::DataType& row : ProtUtilsN::DataTypes) {
        if ((mask & row.typeFlag) != 0) return std::string(row.typeString);
    }
    return "none";
}

TEST_F(DriverAgreementTest, TagsMayUseTheOfferedRangesAndNothingBeyond) {
    int compared = 0;
    for (const auto& model : root().child("models").children("model")) {
        configure("model=" + textOf(model));
        for (const auto& offer : model.children("memtype_ref")) {
            const std::string area = textOf(offer);
            const auto uri = [&area](int address) {
                return "1?" + area + "?" + std::to_string(address) + "?" + admittedType(area);
            };
            const int min = offer.attribute("min").as_int();
            // Of the node override, only the first index has a meaning.
            const int max = area == "NO" ? 0 : offer.attribute("max").as_int();
            EXPECT_TRUE(acceptsTag(uri(min))) << "model " << textOf(model) << ": " << uri(min);
            EXPECT_TRUE(acceptsTag(uri(max))) << "model " << textOf(model) << ": " << uri(max);
            EXPECT_FALSE(acceptsTag(uri(min - 1))) << "model " << textOf(model) << ": " << area;
            EXPECT_FALSE(acceptsTag(uri(max + 1))) << "model " << textOf(model) << ": " << area;
            ++compared;
        }
    }
    EXPECT_EQ(4 + 3 + 12 + 12, compared);
}

TEST_F(DriverAgreementTest, WriteFunctionsOfferedAreTheFunctionsUsed) {
    const auto parameters = root().child("parameters");
    for (const std::string& choice : childTexts(childWithText(parameters, "presetFunction"))) {
        configure("presetFunction=" + choice);
        EXPECT_EQ(std::stoi(choice), writeFunctionOf("1?HREG?400001?unsignedShort"));
    }
    for (const std::string& choice : childTexts(childWithText(parameters, "forceFunction"))) {
        configure("forceFunction=" + choice);
        EXPECT_EQ(std::stoi(choice), writeFunctionOf("1?OUTP?1?boolean"));
    }
}

}  // namespace
}  // namespace description_test
