#include "tests/unit/description/Document.h"

#include <zlib.h>

#include <charconv>
#include <cstring>

#include "description/GetXml.h"

namespace description_test {
namespace {

constexpr std::string_view lengthKey = "compressedXML=";

std::string_view lengthLine() {
    return reinterpret_cast<const char*>(GetXml_MRTU());
}

}  // namespace

std::size_t declaredStreamLength() {
    const std::string_view line = lengthLine();
    if (!line.starts_with(lengthKey)) return 0;
    const std::string_view digits = line.substr(lengthKey.size());
    std::size_t length = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), length);
    return error == std::errc() && end == digits.data() + digits.size() ? length : 0;
}

const unsigned char* stream() {
    return GetXml_MRTU() + lengthLine().size() + 1;
}

Inflated inflateDocument() {
    Inflated inflated{std::string(std::size_t{1} << 20, '\0'), Z_ERRNO, 0};
    z_stream state{};
    if (inflateInit(&state) != Z_OK) return inflated;
    state.next_in = const_cast<Bytef*>(stream());
    state.avail_in = static_cast<uInt>(declaredStreamLength());
    state.next_out = reinterpret_cast<Bytef*>(inflated.text.data());
    state.avail_out = static_cast<uInt>(inflated.text.size());
    inflated.result = inflate(&state, Z_FINISH);
    inflated.leftOver = state.avail_in;
    inflated.text.resize(state.total_out);
    inflateEnd(&state);
    return inflated;
}

pugi::xml_node root() {
    static pugi::xml_document document;
    static const std::string text = inflateDocument().text;
    static const pugi::xml_parse_result parsed =
        document.load_buffer(text.data(), text.size(), pugi::parse_default);
    return parsed ? document.document_element() : pugi::xml_node();
}

std::string textOf(const pugi::xml_node& element) {
    constexpr const char* white = " \t\r\n";
    const std::string text = element.child_value();
    const auto first = text.find_first_not_of(white);
    if (first == std::string::npos) return {};
    return text.substr(first, text.find_last_not_of(white) - first + 1);
}

pugi::xml_node childWithText(const pugi::xml_node& parent, std::string_view text) {
    return parent.find_child([text](const pugi::xml_node& child) { return textOf(child) == text; });
}

Attributes attributesOf(const pugi::xml_node& element) {
    Attributes attributes;
    for (const pugi::xml_attribute& attribute : element.attributes()) {
        attributes.emplace_back(attribute.name(), attribute.value());
    }
    return attributes;
}

std::vector<std::string> childTexts(const pugi::xml_node& parent) {
    std::vector<std::string> texts;
    for (const pugi::xml_node& child : parent.children()) {
        if (child.type() == pugi::node_element) texts.push_back(textOf(child));
    }
    return texts;
}

}  // namespace description_test
