// What a driver accepts in tag URIs without a word, although it was hardly meant. Pure.
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "lint/Finding.h"
#include "lint/TagLines.h"
#include "settings/DriverDescription.h"

namespace lint {

/// What the tags of a configuration stand on.
struct TagSurroundings {
    const settings::Description& description;
    std::set<int> nodes;                       ///< The nodes that the configuration names.
    std::map<int, std::string> models;         ///< Of the named nodes.
    std::string model;                         ///< Of all other nodes.
    std::map<int, std::string> coilFunctions;  ///< "15" or "05", of nodes with one of their own.
    std::string coilFunction;                  ///< Of all other nodes.

    /// @return the node's model; the first of all for an unknown model name, as drivers do. Null
    /// when the description has no models.
    [[nodiscard]] const settings::ModelInfo* modelOf(int node) const;
    /// @return the function that writes the node's coils, as the configuration has it.
    [[nodiscard]] const std::string& coilFunctionOf(int node) const;
};

/// @return the surroundings that a configuration text makes.
TagSurroundings surroundingsOf(const std::string& configText,
                               const settings::Description& description);

/// One tag on its own. Rules: unnamed-node, octal-number, not-a-number, short-address,
/// foreign-address, ignored-subindex, and those of lintAccess() and lintConversions().
Findings lintTag(const TagLine& tag, const TagSurroundings& surroundings);

// Two parts of lintTag(). REQUIRES: the tag is well-formed and accepted.

/// Rules: empty-tag, negative-subindex, outside-area, unusable-node, repeated-coils.
void lintAccess(const TagLine& tag, const TagSurroundings& surroundings, Findings& out);

/// Rules: unknown-conversion, impossible-conversion, partial-conversion, unsuitable-conversion.
void lintConversions(const TagLine& tag, const TagSurroundings& surroundings, Findings& out);

/// Tags against each other. Rules: overlap, shared-register. Each tag is reported once at most,
/// against the first tag in the text that it meets.
Findings lintOverlaps(const std::vector<TagLine>& tags, const settings::Description& description);

/// What the tags' list says of them. Rules: unused-scale, swapped-limits, two-periods; the last
/// reports each tag once at most, against the first tag in the text that it meets.
Findings lintList(const std::vector<TagLine>& tags, const settings::Description& description);

/// Makes the driver's refusal of a tag an error, at the field that is to blame.
Finding tagRefusal(const TagLine& tag, const TagSurroundings& surroundings,
                   const std::string& message);

}  // namespace lint
