// What a driver accepts in tag URIs without a word, although it was hardly meant. Pure.
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "cli/check/Finding.h"
#include "cli/check/TagLines.h"
#include "cli/describe/Description.h"

namespace cli {

/// What the tags of a configuration stand on.
struct TagSurroundings {
    const Description& description;
    std::set<int> nodes;                ///< The nodes that the configuration names.
    std::map<int, std::string> models;  ///< Of the named nodes.
    std::string model;                  ///< Of all other nodes.

    /// @return the node's model; the first of all for an unknown model name, as drivers do. Null
    /// when the description has no models.
    [[nodiscard]] const ModelInfo* modelOf(int node) const;
};

/// @return the surroundings that a configuration text makes.
TagSurroundings surroundingsOf(const std::string& configText, const Description& description);

/// One tag on its own. Rules: unnamed-node, octal-number, not-a-number, short-address,
/// foreign-address, ignored-subindex, unknown-conversion, unsuitable-conversion.
Findings lintTag(const TagLine& tag, const TagSurroundings& surroundings);

/// Tags against each other. Rules: overlap, shared-register. Each tag is reported once at most,
/// against the first tag in the text that it meets.
Findings lintOverlaps(const std::vector<TagLine>& tags, const Description& description);

/// Makes the driver's refusal of a tag an error, at the field that is to blame.
Finding tagRefusal(const TagLine& tag, const TagSurroundings& surroundings,
                   const std::string& message);

}  // namespace cli
