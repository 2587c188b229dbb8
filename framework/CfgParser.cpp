// Finds items in a configuration text.
#include "framework/CfgParser.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <optional>
#include <set>
#include <string_view>

#include "framework/TextUtils.h"

namespace {

constexpr std::string_view kMarker = "CfgVer=1";
constexpr std::string_view kAnyMarker = "CfgVer=";
constexpr std::string_view kNode = "Node";
constexpr std::string_view kNodeEnd = "::";
constexpr std::string_view kBlank = "&nbsp;";

// For a name that no item has, since it holds "=" or white space: it is compared across items. Such
// a key too begins the text or follows white space; elsewhere it is the tail of another name.
std::optional<std::string_view> scanFor(std::string_view text, const std::string& name) {
    const std::string key = name + "=";
    std::size_t at = text.find(key);
    while (at != std::string_view::npos && at != 0 && !ProtUtilsN::isWhiteSpace(text[at - 1])) {
        at = text.find(key, at + 1);
    }
    if (at == std::string_view::npos) return std::nullopt;

    text.remove_prefix(at + key.size());
    const auto* const end = std::find_if(text.begin(), text.end(), ProtUtilsN::isWhiteSpace);
    return text.substr(0, static_cast<std::size_t>(end - text.begin()));
}

std::size_t skipDigits(const std::string& text, std::size_t at) {
    while (at < text.size() && ProtUtilsN::isDecimalDigit(text[at])) {
        ++at;
    }
    return at;
}

std::string nodeName(int node, const char* name) {
    return std::string(kNode) + std::to_string(node) + std::string(kNodeEnd) + name;
}

CfgParser::parseResult deliver(const char* found, std::string& value) {
    if (found == nullptr) return CfgParser::NotFound;
    value = found;
    return CfgParser::Found;
}

bool decode(const std::string& raw, int& value) {
    value = ProtUtilsN::parseInteger(raw.c_str());
    return true;
}

bool decode(const std::string& raw, std::string& value) {
    return CfgParserN::parseValue(raw, value);
}

}  // namespace

CfgParser::CfgParser(const char* text) : text_(text == nullptr ? "" : text) {
    const std::size_t marker = text_.find(kMarker);
    knownFormat_ = marker != std::string::npos;
    if (knownFormat_) {
        const std::size_t start = marker + kMarker.size();
        const std::size_t end = text_.find(kAnyMarker, start);
        text_ = text_.substr(start, end - start);
        collectNodes();
    }
    items_ = CfgItems(text_);
}

void CfgParser::collectNodes() {
    std::set<int> known;
    std::size_t at = text_.find(kNode);
    while (at != std::string::npos) {
        const std::size_t digits = at + kNode.size();
        const std::size_t end = skipDigits(text_, digits);
        if (text_.compare(end, kNodeEnd.size(), kNodeEnd) == 0) {
            const int id = ProtUtilsN::parseDecimal(text_.substr(digits, end - digits).c_str());
            if (known.insert(id).second) nodeIds_.push_back(id);
        }
        at = text_.find(kNode, end);
    }
}

int CfgParser::GetNodeID(int index) const {
    if (index < 0 || index >= GetNodeCount()) return 0;
    return nodeIds_[static_cast<std::size_t>(index)];
}

const char* CfgParser::GetParam(const char* name) {
    const auto value = CfgItems::isName(name) ? items_.find(text_, name) : scanFor(text_, name);
    if (!value) return nullptr;
    lastValue_ = *value;
    return lastValue_.c_str();
}

CfgParser::parseResult CfgParser::getParam(const char* name, int node, std::string& value,
                                           int flags) {
    const bool mustBeCommon = (flags & CommonOnly) != 0;
    const bool mustBePrefixed = (flags & NodeOnly) != 0;
    if (mustBeCommon && mustBePrefixed) return InvalidFlags;

    if (node != -1) {
        const char* own = GetParam(nodeName(node, name).c_str());
        if (own != nullptr && mustBeCommon) return CannotBePrefixed;
        return deliver(own != nullptr ? own : GetParam(name), value);
    }

    const char* common = GetParam(name);
    if (mustBePrefixed && !nodeIds_.empty()) {
        return common != nullptr ? CannotBeNodeIndependent : NotGiven;
    }
    return deliver(common, value);
}

namespace CfgParserN {

namespace {

struct MessageRow {
    CfgParser::parseResult result;
    std::string_view tail;
};

constexpr std::array kMessages{
    MessageRow{CfgParser::Found, "has unknown error"},
    MessageRow{CfgParser::NotGiven, "has unknown error"},
    MessageRow{CfgParser::NotFound, "is not found"},
    MessageRow{CfgParser::IllegalValue, "has illegal value"},
    MessageRow{CfgParser::CannotBePrefixed, "can't be prefixed"},
    MessageRow{CfgParser::CannotBeNodeIndependent, "can't be node independent"},
    MessageRow{CfgParser::InvalidFlags, "has invalid internal specification"},
};

constexpr bool rowsMatchResults() {
    for (std::size_t i = 0; i < kMessages.size(); ++i) {
        if (static_cast<std::size_t>(kMessages[i].result) != i) return false;
    }
    return true;
}
static_assert(kMessages.size() == CfgParser::InvalidFlags + 1);
static_assert(rowsMatchResults());

std::string_view tailOf(CfgParser::parseResult result) {
    const auto* row = std::find_if(kMessages.begin(), kMessages.end(),
                                   [result](const auto& each) { return each.result == result; });
    return row == kMessages.end() ? kMessages.front().tail : row->tail;
}

}  // namespace

bool parseValue(const std::string& raw, std::string& value) {
    std::string decoded;
    std::size_t start = 0;
    for (;;) {
        const std::size_t blank = raw.find(kBlank, start);
        decoded.append(raw, start, blank - start);
        if (blank == std::string::npos) break;
        decoded += ' ';
        start = blank + kBlank.size();
    }
    value = std::move(decoded);
    return true;
}

std::string getErrorString(CfgParser::parseResult result, const char* name) {
    return std::string("Parser: parameter '") + name + "' " + std::string(tailOf(result));
}

}  // namespace CfgParserN

template <class Value>
bool readParam(CfgParser& parser, const char* name, int node, Value& value, int flags,
               bool optional, std::string& error) {
    std::string raw;
    CfgParser::parseResult result = parser.getParam(name, node, raw, flags);
    if (result == CfgParser::Found && !decode(raw, value)) result = CfgParser::IllegalValue;

    if (result == CfgParser::Found || result == CfgParser::NotGiven) return true;
    if (result == CfgParser::NotFound && optional) return true;
    error = CfgParserN::getErrorString(result, name);
    return false;
}

template bool readParam<int>(CfgParser&, const char*, int, int&, int, bool, std::string&);
template bool readParam<std::string>(CfgParser&, const char*, int, std::string&, int, bool,
                                     std::string&);
