// What is to be said about one place of a text.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "settings/Place.h"

namespace lint {

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

}  // namespace lint
