// Tags side by side.
#include <gtest/gtest.h>

#include <random>

#include "lint/LintTags.h"
#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

std::string lint(const std::vector<TagLine>& tags) {
    return placesOf(lintOverlaps(tags, sampleDescription()));
}

TagLine reg(int line, const char* area, unsigned offset, ICU_Type type, int bytes,
            ICU_Type item = ICU_Type::none) {
    return acceptedTag(std::string("1?") + area + "?0?x", line, offset, 0, type, bytes, item);
}

TagLine bit(int line, const char* area, unsigned offset, int index, int count = 1) {
    return acceptedTag(std::string("1?") + area + "?0?x", line, offset, index,
                       count == 1 ? ICU_Type::boolean : ICU_Type::booleanArray, count,
                       count == 1 ? ICU_Type::none : ICU_Type::boolean);
}

TEST(LintOverlapsTest, TagsSideBySideDoNotOverlap) {
    EXPECT_EQ("",
              lint({reg(1, "HREG", 0, ICU_Type::short_, 2), reg(2, "HREG", 1, ICU_Type::float_, 4),
                    reg(3, "HREG", 3, ICU_Type::short_, 2)}));
}

TEST(LintOverlapsTest, TheTagFurtherDownIsReported) {
    EXPECT_EQ("overlap@2:8", lint({reg(1, "HREG", 0, ICU_Type::float_, 4),
                                   reg(2, "HREG", 1, ICU_Type::short_, 2)}));
    EXPECT_EQ("overlap@2:8", lint({reg(1, "HREG", 1, ICU_Type::short_, 2),
                                   reg(2, "HREG", 0, ICU_Type::float_, 4)}));
}

TEST(LintOverlapsTest, SameStartWithAnotherTypeOverlaps) {
    EXPECT_EQ("overlap@2:8", lint({reg(1, "HREG", 5, ICU_Type::short_, 2),
                                   reg(2, "HREG", 5, ICU_Type::unsignedShort, 2)}));
}

TEST(LintOverlapsTest, AnArrayAndItsItemsAreOfOneKind) {
    const TagLine array = reg(1, "HREG", 0, ICU_Type::intArray, 16, ICU_Type::int_);
    EXPECT_EQ("", lint({array, reg(2, "HREG", 2, ICU_Type::int_, 4)}));
    EXPECT_EQ("overlap@2:8", lint({array, reg(2, "HREG", 1, ICU_Type::int_, 4)}))
        << "halves of two items";
}

TEST(LintOverlapsTest, OtherNodesAndAreasAreOtherMemory) {
    TagLine elsewhere = reg(2, "HREG", 0, ICU_Type::float_, 4);
    elsewhere.facts->node = 2;
    EXPECT_EQ("", lint({reg(1, "HREG", 0, ICU_Type::int_, 4), elsewhere,
                        reg(3, "IREG", 0, ICU_Type::short_, 2)}));
}

TEST(LintOverlapsTest, WideRegistersCountByTheirOwnWidth) {
    EXPECT_EQ("",
              lint({reg(1, "LONG", 0, ICU_Type::int_, 4), reg(2, "LONG", 1, ICU_Type::float_, 4)}));
    EXPECT_EQ("overlap@2:8", lint({reg(1, "LONG", 0, ICU_Type::intArray, 8, ICU_Type::int_),
                                   reg(2, "LONG", 1, ICU_Type::float_, 4)}));
}

TEST(LintOverlapsTest, BitWrittenIntoARegisterOfAnotherTagIsReportedAtTheBit) {
    EXPECT_EQ("shared-register@2:8",
              lint({reg(1, "HREG", 4, ICU_Type::short_, 2), bit(2, "HREG", 4, 15)}));
    EXPECT_EQ("shared-register@1:8",
              lint({bit(1, "HREG", 5, 0), reg(2, "HREG", 4, ICU_Type::float_, 4)}));
    EXPECT_EQ("shared-register@1:8",
              lint({bit(1, "HREG", 3, 17), reg(2, "HREG", 4, ICU_Type::short_, 2)}))
        << "bit 17 is in the next register";
}

TEST(LintOverlapsTest, BitSharesTheRegisterWithAByteBesideIt) {
    EXPECT_EQ("shared-register@2:8",
              lint({reg(1, "HREG", 4, ICU_Type::unsignedByte, 1), bit(2, "HREG", 4, 12)}));
}

TEST(LintOverlapsTest, BitsOfOneRegisterAreNoOnesProperty) {
    EXPECT_EQ("", lint({bit(1, "HREG", 4, 0), bit(2, "HREG", 4, 1), bit(3, "HREG", 4, 0, 16)}));
}

TEST(LintOverlapsTest, BitsOfAStatusWordMayBeReadBesideIt) {
    EXPECT_EQ("", lint({reg(1, "IREG", 4, ICU_Type::short_, 2), bit(2, "IREG", 4, 3)}));
}

TEST(LintOverlapsTest, CoilsAreOfOneKind) {
    EXPECT_EQ("", lint({bit(1, "OUTP", 0, 3), bit(2, "OUTP", 0, 0, 16)}));
}

TEST(LintOverlapsTest, ATagIsReportedOnceAgainstTheFirstThatItMeets) {
    const Findings findings = lintOverlaps(
        {reg(1, "HREG", 0, ICU_Type::short_, 2), reg(2, "HREG", 1, ICU_Type::short_, 2),
         reg(3, "HREG", 0, ICU_Type::float_, 4)},
        sampleDescription());
    EXPECT_EQ("overlap@3:8", placesOf(findings));
    EXPECT_NE(findings[0].message.find("tags:1"), std::string::npos) << findings[0].message;
}

TagLine randomTag(std::mt19937& random, int line) {
    const char* const area = random() % 4 == 0 ? "IREG" : "HREG";
    const auto offset = static_cast<unsigned>(random() % 12);
    switch (random() % 6) {
        case 0:
            return bit(line, area, offset, static_cast<int>(random() % 20));
        case 1:
            return bit(line, area, offset, static_cast<int>(random() % 16), 20);
        case 2:
            return reg(line, area, offset, ICU_Type::short_, 2);
        case 3:
            return reg(line, area, offset, ICU_Type::intArray, 4 * static_cast<int>(random() % 4),
                       ICU_Type::int_);
        case 4:
            return reg(line, area, offset, ICU_Type::int_, 4);
        default:
            return reg(line, area, offset, ICU_Type::string, static_cast<int>(random() % 9));
    }
}

/// What the tags give two by two: for each the finding against the first that it meets.
Findings lintPairs(const std::vector<TagLine>& tags) {
    Findings out;
    for (const TagLine& tag : tags) {
        for (const TagLine& other : tags) {
            if (other.place.line == tag.place.line) continue;
            const bool inOrder = other.place.line < tag.place.line;
            const auto found =
                lintOverlaps({inOrder ? other : tag, inOrder ? tag : other}, sampleDescription());
            if (found.empty() || found[0].place.line != tag.place.line) continue;
            out.push_back(found[0]);
            break;
        }
    }
    return out;
}

TEST(LintOverlapsTest, ManyTagsGiveWhatTheirPairsGive) {
    std::mt19937 random(1);
    for (int round = 0; round < 300; ++round) {
        std::vector<TagLine> tags;
        for (int line = 1; line <= 12; ++line)
            tags.push_back(randomTag(random, line));
        const Findings all = lintOverlaps(tags, sampleDescription());
        const Findings pairs = lintPairs(tags);
        ASSERT_EQ(placesOf(all), placesOf(pairs)) << round;
        for (std::size_t i = 0; i < all.size(); ++i)
            ASSERT_EQ(all[i].message, pairs[i].message) << round;
    }
}

TEST(LintOverlapsTest, RefusedAndEmptyTagsTakeNoPart) {
    EXPECT_EQ("", lint({tagLine("1?HREG?400001?x", "tags", 1, 1),
                        reg(2, "HREG", 0, ICU_Type::intArray, 0, ICU_Type::int_),
                        reg(3, "HREG", 0, ICU_Type::short_, 2)}));
}

}  // namespace
}  // namespace lint
