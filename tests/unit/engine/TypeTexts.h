// The data types that the tests walk through, typed independently of the framework's table.
#pragma once

#include <string>
#include <vector>

struct TypeText {
    std::string text;
    int bytes;  ///< Of the run-time form; for bits their number.
    bool bits;
};

/// Every type that a register memory accepts, arrays from one item to several requests.
inline std::vector<TypeText> registerTypes() {
    struct Element {
        const char* name;
        int bytes;
        bool scalar;
    };
    constexpr Element kElements[] = {
        {"boolean", 1, true},     {"byte", 1, true},         {"short", 2, true},
        {"int", 4, true},         {"unsignedByte", 1, true}, {"unsignedShort", 2, true},
        {"unsignedInt", 4, true}, {"float", 4, true},        {"double", 8, true},
        {"uint64", 8, true},      {"int64", 8, true},        {"string", 1, false},
        {"binary", 1, false},
    };
    constexpr int kCounts[] = {1, 2, 3, 7, 16, 17, 63, 125, 126, 251, 600};
    std::vector<TypeText> types;
    for (const Element& element : kElements) {
        const std::string name = element.name;
        const bool bits = name == "boolean";
        if (element.scalar) types.push_back({name, element.bytes, bits});
        for (const int count : kCounts)
            types.push_back({name + "-" + std::to_string(count), element.bytes * count, bits});
    }
    return types;
}
