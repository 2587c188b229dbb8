#include "values/NearestName.h"

#include <algorithm>

namespace values {
namespace {

char lower(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

bool same(char a, char b) {
    return lower(a) == lower(b);
}

}  // namespace

// Optimal string alignment: three rows of the table are enough to see exchanged neighbours.
std::size_t editDistance(std::string_view a, std::string_view b) {
    std::vector<std::size_t> beforeLast(b.size() + 1);
    std::vector<std::size_t> last(b.size() + 1);
    std::vector<std::size_t> row(b.size() + 1);
    for (std::size_t j = 0; j <= b.size(); ++j)
        row[j] = j;
    for (std::size_t i = 1; i <= a.size(); ++i) {
        beforeLast.swap(last);
        last.swap(row);
        row[0] = i;
        for (std::size_t j = 1; j <= b.size(); ++j) {
            const std::size_t replaced = last[j - 1] + (same(a[i - 1], b[j - 1]) ? 0 : 1);
            row[j] = std::min({last[j] + 1, row[j - 1] + 1, replaced});
            const bool exchanged =
                i > 1 && j > 1 && same(a[i - 1], b[j - 2]) && same(a[i - 2], b[j - 1]);
            if (exchanged) row[j] = std::min(row[j], beforeLast[j - 2] + 1);
        }
    }
    return row[b.size()];
}

std::string nearestName(std::string_view word, const std::vector<std::string>& names) {
    const std::size_t limit = std::max<std::size_t>(2, word.size() / 3);
    std::string nearest;
    std::size_t best = limit + 1;
    for (const std::string& name : names) {
        const std::size_t distance = editDistance(word, name);
        // A short name is near to everything: something of it has to be in the word.
        if (distance < best && distance < std::max(name.size(), word.size())) {
            best = distance;
            nearest = name;
        }
    }
    return nearest;
}

}  // namespace values
