// Random lists of tag URIs for the nodes of LoadedDriver: dense, so that tags overlap, nest, repeat
// and touch, some at an area's end, some beyond it.
#pragma once

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <random>
#include <string>
#include <vector>

namespace poll_test {

/// Threads: one at a time.
class RandomTags {
  public:
    explicit RandomTags(std::uint32_t seed) : random_(seed) {}

    /// @return 1..`most` URIs of one or two nodes and one or two areas within one window.
    std::vector<std::string> list(int most) {
        const int node = below(3) + 1;
        const int otherNode = below(2) == 0 ? node : below(3) + 1;
        const Area& area = kAreas[pick(std::size(kAreas))];
        const Area& otherArea = kAreas[pick(std::size(kAreas))];
        const int window = below(8) == 0 ? kItems - 40 : below(700);
        std::vector<std::string> uris;
        for (int left = 1 + below(most); left > 0; --left)
            uris.push_back(
                tag(below(4) == 0 ? otherNode : node, below(3) == 0 ? otherArea : area, window));
        if (uris.size() > 2 && below(3) == 0) uris.push_back(uris.front());
        return uris;
    }

  private:
    struct Area {
        const char* name;
        int base;
        bool bits;
    };
    static constexpr int kItems = 65536;
    static constexpr Area kAreas[] = {{"OUTP", 0, true},
                                      {"INP", 100000, true},
                                      {"HREG", 400000, false},
                                      {"IREG", 300000, false},
                                      {"LONG", 5000, false}};

    int below(int limit) { return static_cast<int>(random_() % static_cast<unsigned>(limit)); }
    std::size_t pick(std::size_t count) { return random_() % count; }

    std::string tag(int node, const Area& wanted, int window) {
        const bool longs = wanted.base == 5000;
        const Area& area = longs && node != 3 ? kAreas[2] : wanted;
        // Only so many 32-bit registers are there; items count from 0 on the zero-based node.
        const int first = area.base + (area.base == 5000 ? window % 700 : window) +
                          (area.base == 5000 || node == 2 ? 0 : 1);
        const int span = area.bits ? 120 : 40;
        const int item = std::min(first + below(span), area.base + kItems - (node == 2 ? 1 : 0));
        std::string uri = std::to_string(node) + "?" + area.name + "?" + std::to_string(item);
        return uri + (area.bits ? bitType() : area.base == 5000 ? longType() : registerType());
    }
    std::string bitType() {
        static constexpr int kCounts[] = {2, 3, 8, 9, 16, 40, 300};
        if (below(2) == 0) return "?boolean";
        return "?boolean-" + std::to_string(kCounts[pick(std::size(kCounts))]);
    }
    std::string longType() {
        static constexpr const char* kTypes[] = {
            "unsignedInt",   "int",      "float",    "int(swap2)",
            "unsignedInt-3", "float-70", "int(inv)", "unsignedInt(swap4)"};
        return std::string("?") + typeOf(kTypes);
    }
    std::string registerType() {
        static constexpr const char* kTypes[] = {
            "short",         "unsignedShort", "unsignedShort", "int",
            "float",         "float(swap2)",  "double",        "int64(swap8)",
            "byte",          "unsignedByte",  "string-3",      "string-8",
            "string-5",      "short-4",       "int-3",         "unsignedShort(bcd)",
            "binary-7",      "short(neg)",    "short-130",     "unsignedShort(inv)",
            "short-6(swap2)"};
        switch (below(5)) {
            case 0:
                return "." + std::to_string(below(16)) + "?boolean";
            case 1:
                return "." + std::to_string(below(40)) + bitType();
            default:
                return std::string("?") + typeOf(kTypes);
        }
    }
    template <std::size_t Count>
    const char* typeOf(const char* const (&types)[Count]) {
        return types[pick(Count)];
    }

    std::minstd_rand random_;
};

}  // namespace poll_test
