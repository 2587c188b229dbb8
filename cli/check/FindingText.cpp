// Prints findings and turns them into an exit code.
#include "cli/check/FindingText.h"

#include <fmt/format.h>

#include "values/JsonValues.h"
#include "values/TextEscapes.h"

namespace cli {
namespace {

using lint::Finding;
using lint::Findings;
using lint::Severity;
using values::Json;

const char* word(Severity severity) {
    return severity == Severity::Error ? "error" : "warning";
}

}  // namespace

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

std::string reportDocument(const Findings& findings, std::size_t tagsChecked) {
    const Json object{{"errors", lint::countOf(findings, Severity::Error)},
                      {"warnings", lint::countOf(findings, Severity::Warning)},
                      {"tagsChecked", tagsChecked},
                      {"findings", findingsJson(findings)}};
    // File names and texts may be anything; what is not UTF-8 is shown as such.
    return object.dump(2, ' ', false, Json::error_handler_t::replace) + '\n';
}

ExitCode verdictOf(const Findings& findings, bool warningsCount) {
    if (lint::countOf(findings, Severity::Error) > 0) return ExitCode::Usage;
    return warningsCount && !findings.empty() ? ExitCode::Other : ExitCode::Done;
}

}  // namespace cli
