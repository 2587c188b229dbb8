#include "lint/TagLines.h"

#include <algorithm>

#include "values/ByteOrder.h"
#include "values/ValueError.h"

namespace lint {
namespace {

using settings::Place;

constexpr std::string_view kBlanks = " \t";

/// @return the text without blanks at both ends; `skipped` receives how many were in front.
std::string_view trim(std::string_view text, std::size_t& skipped) {
    skipped = std::min(text.find_first_not_of(kBlanks), text.size());
    text.remove_prefix(skipped);
    return text.substr(0, text.find_last_not_of(kBlanks) + 1);
}

std::vector<UriField> fieldsOf(std::string_view uri, int column) {
    std::vector<UriField> fields;
    std::size_t at = 0;
    while (true) {
        const std::size_t end = std::min(uri.find('?', at), uri.size());
        std::size_t skipped = 0;
        const std::string_view text = trim(uri.substr(at, end - at), skipped);
        fields.push_back({std::string(text), column + static_cast<int>(at + skipped)});
        if (end == uri.size()) return fields;
        at = end + 1;
    }
}

}  // namespace

std::string TagLine::address() const {
    const std::string& text = fields[2].text;
    return text.substr(0, text.find('.'));
}

std::optional<std::string> TagLine::subIndex() const {
    const std::string& text = fields[2].text;
    const std::size_t dot = text.find('.');
    if (dot == std::string::npos) return std::nullopt;
    return text.substr(dot + 1);
}

Place TagLine::placeOf(std::size_t field) const {
    Place at = place;
    if (field < fields.size()) at.column = fields[field].column;
    return at;
}

TagLine tagLine(std::string_view uri, const std::string& source, int line, int column) {
    TagLine tag{.uri = std::string(uri),
                .place = {source, line, column},
                .fields = {},
                .facts = std::nullopt,
                .driverUri = std::string(uri),
                .orderRefusal = {}};
    try {
        tag.driverUri = values::withoutByteOrder(tag.uri);
    } catch (const values::ValueError& error) {
        tag.orderRefusal = error.what();
    }
    tag.fields = fieldsOf(tag.driverUri, column);
    return tag;
}

DataTypeText dataTypeText(std::string_view text) {
    DataTypeText parts;
    std::size_t skipped = 0;
    const std::size_t open = text.find('(');
    const std::string_view name = trim(text.substr(0, open), skipped);
    const std::size_t dash = name.find('-');
    parts.name = name.substr(0, dash == std::string_view::npos ? dash : dash + 1);
    if (open == std::string_view::npos) return parts;

    std::string_view list = text.substr(open + 1);
    list = list.substr(0, list.find(')'));
    for (bool more = true; more;) {
        const std::size_t comma = list.find(',');
        parts.conversions.emplace_back(trim(list.substr(0, comma), skipped));
        more = comma != std::string_view::npos;
        if (more) list.remove_prefix(comma + 1);
    }
    return parts;
}

}  // namespace lint
