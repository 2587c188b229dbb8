// Findings as people and programs read them. Pure.
#pragma once

#include <cstddef>
#include <string>

#include "cli/ExitCode.h"
#include "lint/Finding.h"
#include "values/Json.h"

namespace cli {

/// @return two lines a finding: "source:line:column: warning: message [rule]" and, where there is
/// one, the suggestion below; nothing for no findings.
std::string findingsText(const lint::Findings& findings);
/// @return an array with one object a finding.
values::Json findingsJson(const lint::Findings& findings);
/// @return the findings and their numbers as one JSON document.
std::string reportDocument(const lint::Findings& findings, std::size_t tagsChecked);

/// @return 2 (Usage) with errors, 1 (Other) with warnings that count, else 0 (Done).
ExitCode verdictOf(const lint::Findings& findings, bool warningsCount);

}  // namespace cli
