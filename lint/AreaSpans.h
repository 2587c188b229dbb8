// The tags of each area side by side. Pure.
#pragma once

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "lint/TagLines.h"
#include "lint/TagSpan.h"
#include "settings/DriverDescription.h"

namespace lint {

/// What a tag stands for, and the tag.
struct Span : TagSpan {
    const TagLine* tag;
    std::size_t order;  ///< In the text.
    bool readOnly;
};

/// Node and name.
using Area = std::pair<int, std::string>;

/// @return the accepted tags by area, in the order of the text; those of unknown areas are left
/// out.
std::map<Area, std::vector<Span>> spansByArea(const std::vector<TagLine>& tags,
                                              const settings::Description& description);

/// @return the tag's URI and where it stands, as messages about another tag have it.
std::string placed(const Span& span);

}  // namespace lint
