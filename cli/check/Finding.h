// What `mrtu check` has to say about one place of a text.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "cli/ExitCode.h"
#include "settings/Place.h"
#include "values/JsonValues.h"

namespace cli {

enum class Severity : std::uint8_t {
    Warning,  ///< The driver accepts it, but hardly as it was meant.
    Error,    ///< The driver refuses it, or every access to it.
};

struct Finding {
    Severity severity;
    std::string rule;  ///< A name that does not change, e.g. "unknown-key".
    settings::Place place;
    std::string message;
    std::string suggestion;  ///< What to write instead; may be empty.
};

using Findings = std::vector<Finding>;

void warn(Findings& out, const char* rule, const settings::Place& place, std::string message,
          std::string suggestion);

int countOf(const Findings& findings, Severity severity);

/// Sorts by source (in order of first appearance), line and column; what shares a place keeps its
/// order.
void sortByPlace(Findings& findings);

/// @return two lines a finding: "source:line:column: warning: message [rule]" and, where there is
/// one, the suggestion below; nothing for no findings.
std::string findingsText(const Findings& findings);
/// @return an array with one object a finding.
values::Json findingsJson(const Findings& findings);

/// @return 2 (Usage) with errors, 1 (Other) with warnings that count, else 0 (Done).
ExitCode verdictOf(const Findings& findings, bool warningsCount);

}  // namespace cli
