#include "settings/ConfigScan.h"

#include <algorithm>

namespace settings {
namespace {

constexpr std::string_view kMarker = "CfgVer=1";
constexpr std::string_view kNextMarker = "CfgVer=";
constexpr std::string_view kWhite = " \t\n\v\f\r";
constexpr std::string_view kNode = "Node";

void splitNodePrefix(ScannedItem& item) {
    const std::size_t colons = item.name.find("::");
    if (!item.name.starts_with(kNode) || colons == std::string::npos) return;
    item.node = item.name.substr(kNode.size(), colons - kNode.size());
    item.key = item.name.substr(colons + 2);
}

ScannedItem itemOf(std::string_view word, const Place& place) {
    ScannedItem item{};
    // An "=" that stands alone, or in front, names nothing.
    const std::size_t equals = word.find('=') == 0 ? std::string_view::npos : word.find('=');
    item.word = word;
    item.name = word.substr(0, equals);
    item.key = item.name;
    item.place = place;
    item.valuePlace = place;
    if (equals != std::string_view::npos) {
        item.value = std::string(word.substr(equals + 1));
        item.valuePlace.column += static_cast<int>(equals) + 1;
    }
    splitNodePrefix(item);
    return item;
}

/// Places of a text, asked for from its front to its end: each character is looked at once.
class PlaceWalk {
  public:
    PlaceWalk(const std::string& source, std::string_view text) : source_(source), text_(text) {}

    Place at(std::size_t index) {
        for (; at_ < index; ++at_) {
            if (text_[at_] != '\n') continue;
            ++line_;
            lineStart_ = at_ + 1;
        }
        return {source_, line_, static_cast<int>(index - lineStart_) + 1};
    }

  private:
    std::string source_;
    std::string_view text_;
    std::size_t at_ = 0;
    std::size_t lineStart_ = 0;
    int line_ = 1;
};

}  // namespace

Place placeIn(const std::string& source, std::string_view text, std::size_t index) {
    return PlaceWalk(source, text).at(index);
}

const ScannedItem* ScannedConfig::item(std::string_view name) const {
    const auto found = firstOf.find(name);
    return found != firstOf.end() ? &items[found->second] : nullptr;
}

ScannedConfig scanConfig(const std::string& source, std::string_view text) {
    ScannedConfig config;
    config.end = placeIn(source, text, text.size());
    const std::size_t marker = text.find(kMarker);
    if (marker == std::string_view::npos) return config;
    config.marked = true;
    if (const std::size_t word = text.find_first_not_of(kWhite); word < marker) {
        config.ignoredFront = placeIn(source, text, word);
    }

    const std::size_t begin = marker + kMarker.size();
    const std::size_t next = text.find(kNextMarker, begin);
    if (next != std::string_view::npos) config.ignoredRemainder = placeIn(source, text, next);
    const std::string_view body = text.substr(0, next);
    PlaceWalk places(source, text);
    for (std::size_t at = body.find_first_not_of(kWhite, begin); at != std::string_view::npos;) {
        const std::size_t end = std::min(body.find_first_of(kWhite, at), body.size());
        const ScannedItem item = itemOf(body.substr(at, end - at), places.at(at));
        if (item.value) config.firstOf.emplace(item.name, config.items.size());
        config.items.push_back(item);
        at = body.find_first_not_of(kWhite, end);
    }
    return config;
}

}  // namespace settings
