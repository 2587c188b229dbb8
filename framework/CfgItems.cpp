#include "framework/CfgItems.h"

#include <algorithm>
#include <functional>

#include "framework/TextUtils.h"

namespace {

using ProtUtilsN::isWhiteSpace;

std::size_t hashOf(std::string_view name) {
    return std::hash<std::string_view>{}(name);
}

}  // namespace

CfgItems::CfgItems(std::string_view text) {
    std::size_t begin = 0;
    for (std::size_t at = 0; at <= text.size(); ++at) {
        if (at < text.size() && !isWhiteSpace(text[at])) continue;
        addItem(text, begin, at);
        begin = at + 1;
    }
    std::sort(items_.begin(), items_.end(), standsBefore);
}

void CfgItems::addItem(std::string_view text, std::size_t begin, std::size_t end) {
    const std::string_view piece = text.substr(begin, end - begin);
    const std::size_t nameLength = piece.find('=');
    if (nameLength == std::string_view::npos) return;
    items_.push_back({hashOf(piece.substr(0, nameLength)), begin, nameLength, end});
}

bool CfgItems::standsBefore(const Item& a, const Item& b) {
    return a.hash != b.hash ? a.hash < b.hash : a.begin < b.begin;
}

std::optional<std::string_view> CfgItems::find(std::string_view text, std::string_view name) const {
    const Item wanted{hashOf(name), 0, 0, 0};
    auto item = std::lower_bound(items_.begin(), items_.end(), wanted, standsBefore);
    for (; item != items_.end() && item->hash == wanted.hash; ++item) {
        if (text.substr(item->begin, item->nameLength) != name) continue;
        const std::size_t value = item->begin + item->nameLength + 1;
        return text.substr(value, item->end - value);
    }
    return std::nullopt;
}

bool CfgItems::isName(std::string_view name) {
    return std::none_of(name.begin(), name.end(),
                        [](char each) { return each == '=' || isWhiteSpace(each); });
}
