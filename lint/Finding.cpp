#include "lint/Finding.h"

#include <algorithm>
#include <map>
#include <tuple>
#include <utility>

namespace lint {
void warn(Findings& out, const char* rule, const settings::Place& place, std::string message,
          std::string suggestion) {
    out.push_back({Severity::Warning, rule, place, std::move(message), std::move(suggestion)});
}

int countOf(const Findings& findings, Severity severity) {
    return static_cast<int>(
        std::count_if(findings.begin(), findings.end(),
                      [&](const Finding& each) { return each.severity == severity; }));
}

void sortByPlace(Findings& findings) {
    std::map<std::string, std::size_t> sources;
    for (const Finding& finding : findings)
        sources.emplace(finding.place.source, sources.size());
    std::stable_sort(findings.begin(), findings.end(), [&](const Finding& a, const Finding& b) {
        return std::tuple(sources[a.place.source], a.place.line, a.place.column) <
               std::tuple(sources[b.place.source], b.place.line, b.place.column);
    });
}

}  // namespace lint
