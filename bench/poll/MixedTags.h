// The tags of a panel: numbers, texts and bits at random places of all areas, in no order.
#pragma once

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <random>
#include <string>
#include <vector>

namespace bench {

/// Where the tags lie.
struct MixedTags {
    int tags = 1000;
    int nodes = 4;   ///< 1..nodes.
    int span = 400;  ///< Items of each area among which the tags lie.
    std::uint32_t seed = 1;
};

namespace mixed {

inline std::string number(std::minstd_rand& random, int limit) {
    return std::to_string(random() % static_cast<unsigned>(limit));
}

inline std::string bitTag(std::minstd_rand& random, int item, int base) {
    const char* type = random() % 4 == 0 ? "?boolean-8" : "?boolean";
    return std::to_string(base + item) + type;
}

inline std::string registerTag(std::minstd_rand& random, int item, int base) {
    static constexpr const char* kTypes[] = {"unsignedShort", "unsignedShort", "short",   "float",
                                             "int",           "double",        "string-8"};
    const std::string address = std::to_string(base + item);
    if (random() % 6 == 0) return address + "." + number(random, 16) + "?boolean";
    return address + "?" + kTypes[random() % std::size(kTypes)];
}

}  // namespace mixed

/// @return so many URIs, the same ones for the same seed, as many in each node and area.
inline std::vector<std::string> mixedTags(const MixedTags& wanted) {
    std::minstd_rand random(wanted.seed);
    std::vector<std::string> uris;
    for (int tag = 0; tag < wanted.tags; ++tag) {
        const std::string node = std::to_string(1 + tag % wanted.nodes);
        const int item = 1 + static_cast<int>(random() % static_cast<unsigned>(wanted.span));
        switch (tag / wanted.nodes % 4) {
            case 0:
                uris.push_back(node + "?OUTP?" + mixed::bitTag(random, item, 0));
                break;
            case 1:
                uris.push_back(node + "?INP?" + mixed::bitTag(random, item, 100000));
                break;
            case 2:
                uris.push_back(node + "?IREG?" + mixed::registerTag(random, item, 300000));
                break;
            default:
                uris.push_back(node + "?HREG?" + mixed::registerTag(random, item, 400000));
        }
    }
    std::shuffle(uris.begin(), uris.end(), random);
    return uris;
}

}  // namespace bench
