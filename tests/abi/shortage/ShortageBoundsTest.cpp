// What is refused before memory is taken for it.
#include <gtest/gtest.h>

#include "tests/abi/shortage/Operations.h"
#include "tests/abi/shortage/ShortMemory.h"

namespace shortage {
namespace {

std::string refusalOf(const std::string& uri) {
    World world(plugin(), Stage::started);
    world.target = world.protocol->CreateTag(uri.c_str());
    if (world.target == nullptr) return world.protocol->GetLastErrorString();
    forgetLargest();
    const int done = world.protocol->Read(world.target, world.out());
    const std::string text = done != 0 ? "read" : world.protocol->GetLastErrorString();
    const std::string line = "read " + uri;
    EXPECT_EQ(1, world.protocol->DoCommand(line.c_str(), world.text(), 200)) << uri;
    EXPECT_EQ(text, world.text()) << uri;
    // Far less than the tags would need; what remains is for the texts.
    EXPECT_GT(4096U, largestRequest()) << uri;
    return text;
}

TEST(ShortageBoundsTest, ATagThatCannotBeReadTakesNoMemory) {
    const char* const kExceeds = "Tag exceeds the memory area";
    for (const char* uri :
         {"1?HREG?400001?string-1000000000", "1?HREG?400001?binary-2147483647",
          "1?HREG?400001.2000000000?boolean", "1?OUTP?1?boolean-2000000000",
          "1?HREG?400001?double-2000000000", "1?HREG?465536?string-3", "1?HREG?400001?int-32769"})
        EXPECT_EQ(kExceeds, refusalOf(uri)) << uri;
    EXPECT_EQ("Tag's bit index is negative", refusalOf("1?HREG?400001.-13?boolean"));
    EXPECT_EQ("Tag length is not positive", refusalOf("1?HREG?400001?string--7"));
}

TEST(ShortageBoundsTest, ABitFarFromTheImagesStartIsConvertedWithoutMemory) {
    World world(plugin(), Stage::started);
    makeTarget(world, "1?HREG?400001.60000?boolean");
    forgetLargest();
    EXPECT_TRUE(world.target->ConvertVariable(value(), world.out(), false));
    EXPECT_EQ(0U, largestRequest());
}

TEST(ShortageBoundsTest, ANegativeBitIsNotConverted) {
    for (const char* uri : {"1?HREG?400001.-13?boolean", "1?HREG?400001.-2147483648?boolean",
                            "1?HREG?400001.-1?boolean-3"}) {
        World world(plugin(), Stage::started);
        makeTarget(world, uri);
        for (const bool toDevice : {true, false}) {
            EXPECT_FALSE(world.target->ConvertVariable(value(), world.out(), toDevice)) << uri;
            EXPECT_FALSE(world.target->Convert(value(), world.out(), toDevice)) << uri;
        }
        EXPECT_TRUE(world.bufferUntouched()) << uri;
    }
}

TEST(ShortageBoundsTest, ModuleWithoutAFactoryInitFailsWithAText) {
    World world(plugin(), Stage::loaded);
    EXPECT_EQ(0, world.module.Init(nullptr));
    EXPECT_STREQ("Interface factory not given", world.module.GetLastError());
    EXPECT_EQ(1, world.module.Init(&world.host));
    EXPECT_EQ(1, world.module.Init(nullptr)) << "the services are held already";
    world.module.Close();
}

}  // namespace
}  // namespace shortage
