// The description against the registry: what the tools offer is what the driver accepts, but for
// the differences that are listed here.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>

#include "framework/DataTypes.h"
#include "framework/MemoryManager.h"
#include "mrtu/MemoryMap.h"
#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

const std::vector<std::string> driverAreas{"NO",      "NP_Mode", "SP_Baud", "SP_Par",
                                           "SP_Stop", "SP_Mode", "SP_Done"};

/// Areas that the registry holds in a model although the description does not offer them there.
const std::map<std::string, std::vector<std::string>> notOffered{
    {"1", driverAreas},
    {"2", {"IREG", "NO", "NP_Mode", "SP_Baud", "SP_Par", "SP_Stop", "SP_Mode", "SP_Done"}},
    {"3", {}},
    {"4", {}},
};

const MemoryManager& registry() {
    static const MemoryManager manager = [] {
        MemoryManager filled;
        _MRTU::registerModels(filled);
        return filled;
    }();
    return manager;
}

std::vector<std::string> registeredNames(const Model& model) {
    std::vector<std::string> names;
    for (const MemoryType& type : model.getMemoryTypes())
        names.push_back(type.getName());
    return names;
}

pugi::xml_node describedModel(const std::string& name) {
    return childWithText(root().child("models"), name);
}

std::string typeString(ICU_Type type) {
    return std::string(ProtUtilsN::DataTypes.at(static_cast<std::size_t>(type) - 1).typeString);
}

/// Everything but the range, which belongs to the model.
void expectSameSettings(const MemoryType& type, const pugi::xml_node& described) {
    SCOPED_TRACE(type.getName());
    EXPECT_EQ(typeString(type.getNaturalType()), described.attribute("naturalType").value());
    EXPECT_EQ(static_cast<unsigned>(type.getIcomTypes()),
              described.attribute("icomTypes").as_uint());
    EXPECT_EQ(type.getBlockReadCount(), described.attribute("blockReadCount").as_int(-1));
    EXPECT_EQ(type.getBlockWriteCount(), described.attribute("blockWriteCount").as_int(-1));
    EXPECT_EQ(type.isBitWrite(), described.attribute("canBitWrite").as_bool());
    EXPECT_EQ(type.isBitArrayWrite(), described.attribute("canBitArrayWrite").as_bool());
    EXPECT_EQ(type.isBitRead(), described.attribute("mustBitRead").as_bool());
    EXPECT_EQ(type.isReadOnly(), described.attribute("isReadOnly").as_bool());
    EXPECT_EQ(type.isWriteOnly(), described.attribute("isWriteOnly").as_bool());
    EXPECT_EQ(type.isSwap2(), described.attribute("isSwap2").as_bool());
    EXPECT_EQ(type.isSwap4(), described.attribute("isSwap4").as_bool());
    EXPECT_EQ(type.isSwap8(), described.attribute("isSwap8").as_bool());
    EXPECT_EQ(type.isInDatagram(), described.attribute("useInDatagram").as_bool());
    EXPECT_EQ(type.hasInternalConversion(), described.attribute("hasInternalConversion").as_bool());
}

TEST(RegistryAgreementTest, HaveTheSameModels) {
    std::vector<std::string> names;
    for (const Model& model : registry().getModels()) {
        names.push_back(model.getName());
        const auto described = describedModel(model.getName());
        EXPECT_EQ(model.getMaxDatagramItems(), described.attribute("datagramCount").as_int(-1));
        EXPECT_EQ(model.getMaxDatagramLength(), described.attribute("datagramLength").as_int(-1));
    }
    EXPECT_EQ(names, childTexts(root().child("models")));
}

TEST(RegistryAgreementTest, HaveTheSameMemoryTypesInTheSameOrder) {
    EXPECT_EQ(registeredNames(*registry().getModel("3")), childTexts(root().child("memtypes")));
}

TEST(RegistryAgreementTest, AgreeOnEveryMemoryTypeInEveryModel) {
    for (const Model& model : registry().getModels()) {
        SCOPED_TRACE("model " + model.getName());
        for (const MemoryType& type : model.getMemoryTypes()) {
            const auto described = childWithText(root().child("memtypes"), type.getName());
            ASSERT_FALSE(described.empty()) << type.getName();
            expectSameSettings(type, described);
        }
    }
}

TEST(RegistryAgreementTest, GeneralRangesAreThoseOfModelOneAndForLongThoseOfModelThree) {
    for (const auto& described : root().child("memtypes").children("memtype")) {
        const std::string name = textOf(described);
        const MemoryType* type = registry().getMemoryType(name == "LONG" ? "3" : "1", name);
        ASSERT_NE(type, nullptr) << name;
        EXPECT_EQ(type->getMinIndex(), described.attribute("min").as_int(-1)) << name;
        EXPECT_EQ(type->getMaxIndex(), described.attribute("max").as_int(-1)) << name;
    }
}

TEST(RegistryAgreementTest, EveryAreaOfferedInAModelIsRegisteredWithTheSameRange) {
    for (const auto& described : root().child("models").children("model")) {
        for (const auto& reference : described.children("memtype_ref")) {
            SCOPED_TRACE("model " + textOf(described) + ", " + textOf(reference));
            const MemoryType* type = registry().getMemoryType(textOf(described), textOf(reference));
            ASSERT_NE(type, nullptr);
            EXPECT_EQ(type->getMinIndex(), reference.attribute("min").as_int(-1));
            EXPECT_EQ(type->getMaxIndex(), reference.attribute("max").as_int(-1));
        }
    }
}

TEST(RegistryAgreementTest, DifferInExactlyTheListedAreas) {
    for (const auto& [model, missing] : notOffered) {
        const std::vector<std::string> offered = childTexts(describedModel(model));
        std::vector<std::string> difference;
        for (const std::string& name : registeredNames(*registry().getModel(model))) {
            if (std::find(offered.begin(), offered.end(), name) == offered.end()) {
                difference.push_back(name);
            }
        }
        EXPECT_EQ(missing, difference) << "model " << model;
    }
}

TEST(RegistryAgreementTest, InputRegistersOfModelTwoAreRegisteredThoughNotOffered) {
    const MemoryType* type = registry().getMemoryType("2", "IREG");
    ASSERT_NE(type, nullptr);
    EXPECT_EQ(300000, type->getMinIndex());
    EXPECT_EQ(365535, type->getMaxIndex());
    EXPECT_TRUE(childWithText(describedModel("2"), "IREG").empty());
}

}  // namespace
}  // namespace description_test
