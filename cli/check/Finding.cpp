#include "cli/check/Finding.h"

#include <fmt/format.h>

#include <algorithm>
#include <map>
#include <tuple>
#include <utility>

#include "values/TextEscapes.h"

namespace cli {
namespace {

using values::Json;

const char* word(Severity severity) {
    return severity == Severity::Error ? "error" : "warning";
}

}  // namespace

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

std::string findingsText(const Findings& findings) {
    std::string text;
    for (const Finding& finding : findings) {
        const std::string line = fmt::format("{}:{}:{}: {}: {} [{}]", finding.place.source,
                                             finding.place.line, finding.place.column,
                                             word(finding.severity), finding.message, finding.rule);
        // They quote the files, which may hold anything.
        text += values::printableText(line) + '\n';
        if (!finding.suggestion.empty())
            text += "    " + values::printableText(finding.suggestion) + '\n';
    }
    return text;
}

Json findingsJson(const Findings& findings) {
    Json json = Json::array();
    for (const Finding& finding : findings) {
        json.push_back({{"severity", word(finding.severity)},
                        {"rule", finding.rule},
                        {"source", finding.place.source},
                        {"line", finding.place.line},
                        {"column", finding.place.column},
                        {"message", finding.message},
                        {"suggestion", finding.suggestion}});
    }
    return json;
}

ExitCode verdictOf(const Findings& findings, bool warningsCount) {
    if (countOf(findings, Severity::Error) > 0) return ExitCode::Usage;
    return warningsCount && !findings.empty() ? ExitCode::Other : ExitCode::Done;
}

}  // namespace cli
