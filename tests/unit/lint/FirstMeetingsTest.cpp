#include "lint/FirstMeetings.h"

#include <gtest/gtest.h>

#include <random>

namespace lint {
namespace {

using Met = std::vector<std::optional<std::size_t>>;

TEST(FirstMeetingsTest, EndsDoNotBelongToAStretch) {
    const std::vector<Stretch> others{{0, 4, 0}, {4, 8, 0}};
    EXPECT_EQ((Met{0, 1, 0, std::nullopt}),
              firstMeetings({{3, 4, kNoKind}, {4, 5, kNoKind}, {3, 5, kNoKind}, {8, 9, kNoKind}},
                            others));
}

TEST(FirstMeetingsTest, OnlyOtherKindsAreMet) {
    const std::vector<Stretch> all{{0, 4, 0}, {0, 4, 0}, {0, 4, 1}, {0, 4, 2}};
    EXPECT_EQ((Met{2, 2, 0, 0}), firstMeetings(all, all));
}

TEST(FirstMeetingsTest, NoneAmongNone) {
    EXPECT_EQ(Met{}, firstMeetings({}, {{0, 1, 0}}));
    EXPECT_EQ(Met{std::nullopt}, firstMeetings({{0, 1, 0}}, {}));
}

/// Tries every pair.
Met tried(const std::vector<Stretch>& seekers, const std::vector<Stretch>& others) {
    Met met(seekers.size());
    for (std::size_t i = 0; i < seekers.size(); ++i) {
        for (std::size_t j = 0; j < others.size() && !met[i]; ++j) {
            const bool shared =
                seekers[i].begin < others[j].end && others[j].begin < seekers[i].end;
            if (shared && seekers[i].kind != others[j].kind) met[i] = j;
        }
    }
    return met;
}

std::vector<Stretch> randomStretches(std::mt19937& random, bool ofAKind) {
    std::vector<Stretch> stretches;
    for (auto left = random() % 20; left > 0; --left) {
        const auto begin = static_cast<long long>(random() % 24) - 4;
        const auto length = static_cast<long long>(random() % 7);
        const int kind = ofAKind ? static_cast<int>(random() % 4) : kNoKind;
        stretches.push_back({begin, begin + length, kind});
    }
    return stretches;
}

TEST(FirstMeetingsTest, AgreesWithTryingEveryPair) {
    std::mt19937 random(1);
    for (int round = 0; round < 5000; ++round) {
        const auto others = randomStretches(random, true);
        const auto seekers = randomStretches(random, round % 2 == 0);
        ASSERT_EQ(tried(seekers, others), firstMeetings(seekers, others)) << round;
        ASSERT_EQ(tried(others, others), firstMeetings(others, others)) << round;
    }
}

}  // namespace
}  // namespace lint
