#include "cli/inspect/Architecture.h"

#include <elf.h>
#include <gtest/gtest.h>

namespace cli {
namespace {

constexpr std::uint32_t kEabi5 = 0x05000000;
constexpr std::uint32_t kHard = kEabi5 | EF_ARM_ABI_FLOAT_HARD;
constexpr std::uint32_t kSoft = kEabi5 | EF_ARM_ABI_FLOAT_SOFT;

TEST(ArchitectureTest, HasAName) {
    const struct {
        Architecture architecture;
        std::string text, floats, triplet;
    } cases[] = {
        {{EM_X86_64, 64, true, 0}, "x86-64", "", "x86_64-linux-gnu"},
        {{EM_386, 32, true, 0}, "32-bit x86", "", "i386-linux-gnu"},
        {{EM_AARCH64, 64, true, 0}, "64-bit ARM", "", "aarch64-linux-gnu"},
        {{EM_ARM, 32, true, kHard}, "32-bit ARM", "hard", "arm-linux-gnueabihf"},
        {{EM_ARM, 32, true, kSoft}, "32-bit ARM", "soft", "arm-linux-gnueabi"},
        {{EM_ARM, 32, true, kEabi5}, "32-bit ARM", "unmarked", "arm-linux-gnueabi"},
        {{EM_ARM, 32, false, kSoft}, "32-bit ARM, big-endian", "soft", ""},
        {{EM_MIPS, 32, false, 0}, "machine 8, 32-bit, big-endian", "", ""},
        {{EM_X86_64, 32, true, 0}, "machine 62, 32-bit", "", ""},
    };
    for (const auto& row : cases) {
        EXPECT_EQ(row.text, architectureText(row.architecture));
        EXPECT_EQ(row.floats, floatAbiText(row.architecture)) << row.text;
        EXPECT_EQ(row.triplet, debianTriplet(row.architecture)) << row.text;
    }
}

TEST(ArchitectureTest, HardAndSoftFloatDoNotMix) {
    const Architecture hard{EM_ARM, 32, true, kHard};
    const Architecture soft{EM_ARM, 32, true, kSoft};
    const Architecture unmarked{EM_ARM, 32, true, kEabi5};
    EXPECT_TRUE(sameArchitecture(hard, hard));
    EXPECT_FALSE(sameArchitecture(hard, soft));
    EXPECT_TRUE(sameArchitecture(soft, unmarked));
}

TEST(ArchitectureTest, EveryFieldButOtherFlagsCounts) {
    const Architecture desktop{EM_X86_64, 64, true, 0};
    EXPECT_TRUE(sameArchitecture(desktop, {EM_X86_64, 64, true, 0x400}));
    EXPECT_FALSE(sameArchitecture(desktop, {EM_AARCH64, 64, true, 0}));
    EXPECT_FALSE(sameArchitecture(desktop, {EM_X86_64, 32, true, 0}));
    EXPECT_FALSE(sameArchitecture(desktop, {EM_X86_64, 64, false, 0}));
}

}  // namespace
}  // namespace cli
