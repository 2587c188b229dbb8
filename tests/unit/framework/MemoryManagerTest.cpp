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

TEST(MemoryManagerTest, MemoryTypeStartsAsAnEmptyBitArea) {
    const MemoryType area;
    EXPECT_EQ("", area.getName());
    EXPECT_EQ(1, static_cast<int>(area.getNaturalType()));
    EXPECT_EQ(0x3fffff, area.getIcomTypes());
    EXPECT_EQ(0, area.getMinIndex());
    EXPECT_EQ(0, area.getMaxIndex());
    EXPECT_EQ(0, area.getBlockReadCount());
    EXPECT_EQ(0, area.getBlockWriteCount());
    for (const bool flag : {area.isSwap2(), area.isSwap4(), area.isSwap8(), area.isBitWrite(),
                            area.isBitArrayWrite(), area.isReadOnly(), area.isWriteOnly(),
                            area.isInDatagram(), area.hasInternalConversion(), area.isBitRead()}) {
        EXPECT_FALSE(flag);
    }
}

TEST(MemoryManagerTest, MemoryTypeKeepsEveryNumber) {
    MemoryType area;
    area.setName("HREG");
    area.setNaturalType(ICU_Type::unsignedShort);
    area.setIcomTypes(0x10);
    area.setBlockReadCount(125);
    area.setBlockWriteCount(123);
    area.setMinIndex(1);
    area.setMaxIndex(65536);
    EXPECT_EQ("HREG", area.getName());
    EXPECT_EQ("HREG", area.nameRef());
    EXPECT_EQ(ICU_Type::unsignedShort, area.getNaturalType());
    EXPECT_EQ(0x10, area.getIcomTypes());
    EXPECT_EQ(125, area.getBlockReadCount());
    EXPECT_EQ(123, area.getBlockWriteCount());
    EXPECT_EQ(1, area.getMinIndex());
    EXPECT_EQ(65536, area.getMaxIndex());
}

// One setter at a time: no flag may move another one.
TEST(MemoryManagerTest, MemoryTypeKeepsEachFlagApart) {
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
            EXPECT_EQ(get == own, (area.*get)());
        }
        EXPECT_FALSE(area.isWriteOnly());
    }
}

TEST(MemoryManagerTest, ModelStartsEmpty) {
    const Model model("Modicon");
    EXPECT_EQ("Modicon", model.getName());
    EXPECT_EQ(0, model.getMaxDatagramItems());
    EXPECT_EQ(0, model.getMaxDatagramLength());
    EXPECT_TRUE(model.getMemoryTypes().empty());
}

TEST(MemoryManagerTest, ModelKeepsItsDatagramLimitsApart) {
    Model model("Modicon");
    model.setMaxDatagramItems(3);
    model.setMaxDatagramLength(200);
    EXPECT_EQ(3, model.getMaxDatagramItems());
    EXPECT_EQ(200, model.getMaxDatagramLength());
}

TEST(MemoryManagerTest, ModelKeepsMemoryTypesInTheOrderAdded) {
    Model model("Modicon");
    model.addMemoryType(Area("HREG"));
    model.addMemoryType(Area("COIL"));
    model.addMemoryType(Area("hreg"));
    ASSERT_EQ(3U, model.getMemoryTypes().size());
    EXPECT_EQ("HREG", model.getMemoryTypes()[0].getName());
    EXPECT_EQ("COIL", model.getMemoryTypes()[1].getName());
    EXPECT_EQ("hreg", model.getMemoryTypes()[2].getName());
}

TEST(MemoryManagerTest, ModelKeepsTheFirstMemoryTypeOfAName) {
    Model model("Modicon");
    model.addMemoryType(Area("HREG", 10));
    model.addMemoryType(Area("HREG", 20));
    ASSERT_EQ(1U, model.getMemoryTypes().size());
    EXPECT_EQ(10, model.getMemoryTypes()[0].getMaxIndex());
}

TEST(MemoryManagerTest, IsEmptyAtFirst) {
    const MemoryManager manager;
    EXPECT_EQ(nullptr, manager.getModel("Modicon"));
    EXPECT_EQ(nullptr, manager.getMemoryType("Modicon", "HREG"));
}

TEST(MemoryManagerTest, FindsModelsByTheirExactName) {
    MemoryManager manager;
    manager.addModel(Model("Modicon"));
    manager.addModel(Model("Enron"));
    EXPECT_EQ(&manager.getModels()[1], manager.getModel("Enron"));
    EXPECT_EQ(&manager.getModels()[0], manager.getModel("Modicon"));
}

TEST(MemoryManagerTest, TakesTheFirstModelForAnUnknownOne) {
    MemoryManager manager;
    manager.addModel(Model("Modicon"));
    manager.addModel(Model("Enron"));
    for (const char* name : {"", "enron", "Enron ", "Unknown"}) {
        EXPECT_EQ(&manager.getModels()[0], manager.getModel(name)) << name;
    }
}

TEST(MemoryManagerTest, KeepsModelsOfTheSameNameAndFindsTheFirst) {
    MemoryManager manager;
    manager.addModel(ModelWith("Modicon", Area("HREG", 10)));
    manager.addModel(ModelWith("Modicon", Area("COIL", 20)));
    EXPECT_EQ(2U, manager.getModels().size());
    EXPECT_EQ(&manager.getModels()[0], manager.getModel("Modicon"));
    EXPECT_EQ(nullptr, manager.getMemoryType("Modicon", "COIL"));
}

TEST(MemoryManagerTest, HoldsCopies) {
    MemoryManager manager;
    Model model = ModelWith("Modicon", Area("HREG", 10));
    manager.addModel(model);
    model.addMemoryType(Area("COIL"));
    EXPECT_EQ(nullptr, manager.getMemoryType("Modicon", "COIL"));
    ASSERT_NE(manager.getMemoryType("Modicon", "HREG"), nullptr);
    EXPECT_EQ(10, manager.getMemoryType("Modicon", "HREG")->getMaxIndex());
}

TEST(MemoryManagerTest, LooksForMemoryTypesInTheNamedModelOnly) {
    MemoryManager manager;
    manager.addModel(ModelWith("Modicon", Area("HREG", 10)));
    manager.addModel(ModelWith("Enron", Area("COIL", 20)));
    ASSERT_NE(manager.getMemoryType("Enron", "COIL"), nullptr);
    EXPECT_EQ(20, manager.getMemoryType("Enron", "COIL")->getMaxIndex());
    EXPECT_EQ(nullptr, manager.getMemoryType("Enron", "HREG"));
    EXPECT_EQ(nullptr, manager.getMemoryType("Unknown", "HREG"));
    EXPECT_EQ(nullptr, manager.getMemoryType("Modicon", "hreg"));
}

}  // namespace
