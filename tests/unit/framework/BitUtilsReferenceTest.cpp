// The copying functions against the plainest way to do their work: one bit after the other.
#include <gtest/gtest.h>

#include <array>
#include <cstddef>

#include "framework/BitUtils.h"

namespace {

constexpr int kOffsets = 16;
constexpr int kLengths = 71;

bool bitAt(const unsigned char* buffer, int bit) {
    return (buffer[bit / 8] >> (bit % 8) & 1) != 0;
}

void setBit(unsigned char* buffer, int bit, bool on) {
    const int mask = 1 << (bit % 8);
    buffer[bit / 8] =
        static_cast<unsigned char>(on ? buffer[bit / 8] | mask : buffer[bit / 8] & ~mask);
}

void shiftSingly(unsigned char* dst, int dstBit, const unsigned char* src, int srcBit, int count) {
    for (int i = 0; i < count; ++i)
        setBit(dst, dstBit + i, bitAt(src, srcBit + i));
}

void unpackSingly(unsigned char* dst, const unsigned char* src, int srcBit, int count) {
    for (int i = 0; i < count; ++i)
        dst[i] = bitAt(src, srcBit + i) ? 1 : 0;
}

void packSingly(unsigned char* dst, const unsigned char* src, int dstBit, int count) {
    for (int i = 0; i < count; ++i)
        setBit(dst, dstBit + i, src[i] != 0);
}

// One piece of memory for source and destination, so that a wrong byte shows wherever it lies.
using Arena = std::array<unsigned char, 256>;

Arena noise(unsigned seed) {
    Arena arena{};
    unsigned state = seed * 2654435761U + 1;
    for (unsigned char& byte : arena) {
        state = state * 1664525U + 1013904223U;
        byte = static_cast<unsigned char>(state >> 24);
        // Unpacked bits are mostly zero or not, so zeros must not be rare.
        if ((state >> 16 & 1U) != 0) byte = 0;
    }
    return arena;
}

// Runs both on the same memory, the source at 80 and the destination at each of `places`.
template <class Places, class Singly, class Tested>
void compare(const Places& places, Singly singly, Tested tested) {
    constexpr std::size_t kSource = 80;
    for (const std::size_t place : places) {
        for (int length = 0; length < kLengths; ++length) {
            Arena expected =
                noise(static_cast<unsigned>(place) * 100U + static_cast<unsigned>(length));
            Arena actual = expected;
            singly(expected.data() + place, expected.data() + kSource, length);
            tested(actual.data() + place, actual.data() + kSource, length);
            ASSERT_EQ(expected, actual) << "to " << place << ", " << length << " bits";
        }
    }
}

constexpr std::array<std::size_t, 2> kApart{1, 170};
// From wholly in front of the source's bytes to behind them, the bytes next to it included.
constexpr std::array<std::size_t, 20> kTogether{8,  40, 60, 69, 70, 71, 72, 78, 79,  80,
                                                81, 82, 83, 87, 88, 89, 90, 91, 149, 151};

template <class Places>
void compareShifts(const Places& places) {
    for (int to = 0; to < kOffsets; ++to) {
        for (int from = 0; from < kOffsets; ++from) {
            SCOPED_TRACE(testing::Message() << "bit " << from << " to bit " << to);
            compare(
                places,
                [&](auto* dst, const auto* src, int n) { shiftSingly(dst, to, src, from, n); },
                [&](auto* dst, const auto* src, int n) {
                    ProtUtilsN::shiftBits(dst, to, src, from, n);
                });
        }
    }
}

template <class Places>
void compareCopies(const Places& places) {
    for (int bit = 0; bit < kOffsets; ++bit) {
        SCOPED_TRACE(testing::Message() << "bit " << bit);
        compare(
            places,
            [&](auto* dst, const auto* src, int n) { shiftSingly(dst, bit % 8, src, bit, n); },
            [&](auto* dst, const auto* src, int n) { ProtUtilsN::CopyBits(dst, src, bit, n); });
    }
}

template <class Places>
void compareUnpacking(const Places& places) {
    for (int bit = 0; bit < kOffsets; ++bit) {
        SCOPED_TRACE(testing::Message() << "bit " << bit);
        compare(
            places, [&](auto* dst, const auto* src, int n) { unpackSingly(dst, src, bit, n); },
            [&](auto* dst, const auto* src, int n) { ProtUtilsN::UnpackBits(dst, src, bit, n); });
    }
}

template <class Places>
void comparePacking(const Places& places) {
    for (int bit = 0; bit < kOffsets; ++bit) {
        SCOPED_TRACE(testing::Message() << "bit " << bit);
        compare(
            places, [&](auto* dst, const auto* src, int n) { packSingly(dst, src, bit, n); },
            [&](auto* dst, const auto* src, int n) { ProtUtilsN::PackBits(dst, src, bit, n); });
    }
}

TEST(BitUtilsReferenceTest, ShiftBitsDoesWhatSingleStepsDo) {
    compareShifts(kApart);
}

TEST(BitUtilsReferenceTest, CopyBitsDoesWhatSingleStepsDo) {
    compareCopies(kApart);
}

TEST(BitUtilsReferenceTest, UnpackBitsDoesWhatSingleStepsDo) {
    compareUnpacking(kApart);
}

TEST(BitUtilsReferenceTest, PackBitsDoesWhatSingleStepsDo) {
    comparePacking(kApart);
}

// In order of increasing bit number: a bit that was written is read again further on.
TEST(BitUtilsReferenceTest, OverlappingBuffersSeeWhatWasWrittenBefore) {
    compareShifts(kTogether);
    compareCopies(kTogether);
    compareUnpacking(kTogether);
    comparePacking(kTogether);
}

}  // namespace
