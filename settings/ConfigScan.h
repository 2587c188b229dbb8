// A configuration text taken apart the way the driver family's parser looks at it, with the places
// of its words. Pure.
#pragma once

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "settings/Place.h"

namespace settings {

/// One word of the body: "name=value" or "Node<n>::name=value".
struct ScannedItem {
    std::string word;
    std::string name;                 ///< In front of "=", with the node prefix; the whole word
                                      ///< without "=".
    std::string key;                  ///< The name without the node prefix.
    std::optional<std::string> node;  ///< Between "Node" and "::", as written.
    std::optional<std::string> value;
    Place place;
    Place valuePlace;
};

struct ScannedConfig {
    bool marked = false;             ///< The marker "CfgVer=1" is there.
    Place end;                       ///< Behind the last character.
    std::vector<ScannedItem> items;  ///< Of the body.
    /// Where in `items` the first of a full name stands that has a value.
    std::map<std::string, std::size_t, std::less<>> firstOf;
    std::optional<Place> ignoredFront;      ///< Text in front of the marker.
    std::optional<Place> ignoredRemainder;  ///< A second "CfgVer=", which ends the body.

    /// @return the first item of that full name that has a value, the one that counts; or null.
    [[nodiscard]] const ScannedItem* item(std::string_view name) const;
};

ScannedConfig scanConfig(const std::string& source, std::string_view text);

/// @return the place of text[index].
Place placeIn(const std::string& source, std::string_view text, std::size_t index);

}  // namespace settings
