#include "framework/MemoryManager.h"

#include <gtest/gtest.h>

#include <string>

namespace {

MemoryType Area(const char* name, int maxIndex = 0) {
    MemoryType area;
    area.setName(name);
    area.setMaxIndex(maxIndex);
    return area;
}

Model ModelWith(const char* name, const MemoryType& area) {
    Model model(name);
    model.addMemoryType(area);
    return model;
}

TEST(MemoryType, StartsAsAnEmptyBitArea) {
    const MemoryType area;
    EXPECT_EQ(area.getName(), "");
    EXPECT_EQ(static_cast<int>(area.getNaturalType()), 1);
    EXPECT_EQ(area.getIcomTypes(), 0x3fffff);
    EXPECT_EQ(area.getMinIndex(), 0);
    EXPECT_EQ(area.getMaxIndex(), 0);
    EXPECT_EQ(area.getBlockReadCount(), 0);
    EXPECT_EQ(area.getBlockWriteCount(), 0);
    for (const bool flag : {area.isSwap2(), area.isSwap4(), area.isSwap8(), area.isBitWrite(),
                            area.isBitArrayWrite(), area.isReadOnly(), area.isWriteOnly(),
                            area.isInDatagram(), area.hasInternalConversion(), area.isBitRead()}) {
        EXPECT_FALSE(flag);
    }
}

TEST(MemoryType, KeepsEveryNumber) {
    MemoryType area;
    area.setName("HREG");
    area.setNaturalType(ICU_Type::unsignedShort);
    area.setIcomTypes(0x10);
    area.setBlockReadCount(125);
    area.setBlockWriteCount(123);
    area.setMinIndex(1);
    area.setMaxIndex(65536);
    EXPECT_EQ(area.getName(), "HREG");
    EXPECT_EQ(area.nameRef(), "HREG");
    EXPECT_EQ(area.getNaturalType(), ICU_Type::unsignedShort);
    EXPECT_EQ(area.getIcomTypes(), 0x10);
    EXPECT_EQ(area.getBlockReadCount(), 125);
    EXPECT_EQ(area.getBlockWriteCount(), 123);
    EXPECT_EQ(area.getMinIndex(), 1);
    EXPECT_EQ(area.getMaxIndex(), 65536);
}

// One setter at a time: no flag may move another one.
TEST(MemoryType, KeepsEachFlagApart) {
    using Setter = void (MemoryType::*)(bool);
    using Getter = bool (MemoryType::*)() const;
    const std::pair<Setter, Getter> flags[] = {
        {&MemoryType::setSwap2, &MemoryType::isSwap2},
        {&MemoryType::setSwap4, &MemoryType::isSwap4},
        {&MemoryType::setSwap8, &MemoryType::isSwap8},
        {&MemoryType::setBitWrite, &MemoryType::isBitWrite},
        {&MemoryType::setBitArrayWrite, &MemoryType::isBitArrayWrite},
        {&MemoryType::setReadOnly, &MemoryType::isReadOnly},
        {&MemoryType::setInDatagram, &MemoryType::isInDatagram},
        {&MemoryType::setInternalConversion, &MemoryType::hasInternalConversion},
        {&MemoryType::setBitRead, &MemoryType::isBitRead},
    };
    for (const auto& [set, own] : flags) {
        MemoryType area;
        (area.*set)(true);
        for (const auto& [unused, get] : flags) {
            EXPECT_EQ((area.*get)(), get == own);
        }
        EXPECT_FALSE(area.isWriteOnly());
    }
}

TEST(Model, StartsEmpty) {
    const Model model("Modicon");
    EXPECT_EQ(model.getName(), "Modicon");
    EXPECT_EQ(model.getMaxDatagramItems(), 0);
    EXPECT_EQ(model.getMaxDatagramLength(), 0);
    EXPECT_TRUE(model.getMemoryTypes().empty());
}

TEST(Model, KeepsItsDatagramLimitsApart) {
    Model model("Modicon");
    model.setMaxDatagramItems(3);
    model.setMaxDatagramLength(200);
    EXPECT_EQ(model.getMaxDatagramItems(), 3);
    EXPECT_EQ(model.getMaxDatagramLength(), 200);
}

TEST(Model, KeepsMemoryTypesInTheOrderAdded) {
    Model model("Modicon");
    model.addMemoryType(Area("HREG"));
    model.addMemoryType(Area("COIL"));
    model.addMemoryType(Area("hreg"));
    ASSERT_EQ(model.getMemoryTypes().size(), 3U);
    EXPECT_EQ(model.getMemoryTypes()[0].getName(), "HREG");
    EXPECT_EQ(model.getMemoryTypes()[1].getName(), "COIL");
    EXPECT_EQ(model.getMemoryTypes()[2].getName(), "hreg");
}

TEST(Model, KeepsTheFirstMemoryTypeOfAName) {
    Model model("Modicon");
    model.addMemoryType(Area("HREG", 10));
    model.addMemoryType(Area("HREG", 20));
    ASSERT_EQ(model.getMemoryTypes().size(), 1U);
    EXPECT_EQ(model.getMemoryTypes()[0].getMaxIndex(), 10);
}

TEST(MemoryManager, IsEmptyAtFirst) {
    const MemoryManager manager;
    EXPECT_EQ(manager.getModel("Modicon"), nullptr);
    EXPECT_EQ(manager.getMemoryType("Modicon", "HREG"), nullptr);
}

TEST(MemoryManager, FindsModelsByTheirExactName) {
    MemoryManager manager;
    manager.addModel(Model("Modicon"));
    manager.addModel(Model("Enron"));
    EXPECT_EQ(manager.getModel("Enron"), &manager.getModels()[1]);
    EXPECT_EQ(manager.getModel("Modicon"), &manager.getModels()[0]);
}

TEST(MemoryManager, TakesTheFirstModelForAnUnknownOne) {
    MemoryManager manager;
    manager.addModel(Model("Modicon"));
    manager.addModel(Model("Enron"));
    for (const char* name : {"", "enron", "Enron ", "Unknown"}) {
        EXPECT_EQ(manager.getModel(name), &manager.getModels()[0]) << name;
    }
}

TEST(MemoryManager, KeepsModelsOfTheSameNameAndFindsTheFirst) {
    MemoryManager manager;
    manager.addModel(ModelWith("Modicon", Area("HREG", 10)));
    manager.addModel(ModelWith("Modicon", Area("COIL", 20)));
    EXPECT_EQ(manager.getModels().size(), 2U);
    EXPECT_EQ(manager.getModel("Modicon"), &manager.getModels()[0]);
    EXPECT_EQ(manager.getMemoryType("Modicon", "COIL"), nullptr);
}

TEST(MemoryManager, HoldsCopies) {
    MemoryManager manager;
    Model model = ModelWith("Modicon", Area("HREG", 10));
    manager.addModel(model);
    model.addMemoryType(Area("COIL"));
    EXPECT_EQ(manager.getMemoryType("Modicon", "COIL"), nullptr);
    ASSERT_NE(manager.getMemoryType("Modicon", "HREG"), nullptr);
    EXPECT_EQ(manager.getMemoryType("Modicon", "HREG")->getMaxIndex(), 10);
}

TEST(MemoryManager, LooksForMemoryTypesInTheNamedModelOnly) {
    MemoryManager manager;
    manager.addModel(ModelWith("Modicon", Area("HREG", 10)));
    manager.addModel(ModelWith("Enron", Area("COIL", 20)));
    ASSERT_NE(manager.getMemoryType("Enron", "COIL"), nullptr);
    EXPECT_EQ(manager.getMemoryType("Enron", "COIL")->getMaxIndex(), 20);
    EXPECT_EQ(manager.getMemoryType("Enron", "HREG"), nullptr);
    EXPECT_EQ(manager.getMemoryType("Unknown", "HREG"), nullptr);
    EXPECT_EQ(manager.getMemoryType("Modicon", "hreg"), nullptr);
}

}  // namespace
