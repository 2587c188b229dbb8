#include "settings/DriverDescription.h"

#include <algorithm>
#include <pugixml.hpp>

#include "settings/TextError.h"

namespace settings {
namespace {

constexpr const char* kWhite = " \t\r\n";

/// The element's own text; a list's key is followed by white space and the entries.
std::string textOf(const pugi::xml_node& element) {
    const std::string text = element.child_value();
    const std::size_t first = text.find_first_not_of(kWhite);
    if (first == std::string::npos) return {};
    return text.substr(first, text.find_last_not_of(kWhite) - first + 1);
}

std::string attribute(const pugi::xml_node& element, const char* name) {
    return element.attribute(name).value();
}

std::optional<long> number(const pugi::xml_node& element, const char* name) {
    const pugi::xml_attribute found = element.attribute(name);
    if (found.empty()) return std::nullopt;
    return static_cast<long>(found.as_llong());
}

ParameterInfo parameterOf(const pugi::xml_node& element) {
    ParameterInfo info{};
    info.key = textOf(element);
    info.display = attribute(element, "display");
    info.type = attribute(element, "type");
    info.preset = attribute(element, "default");
    if (!element.attribute("defaultValue").empty()) {
        info.defaultValue = attribute(element, "defaultValue");
    }
    info.ofNode = element.attribute("isNodeProperty").as_bool();
    info.mandatory = element.attribute("isMandatory").as_bool();
    info.distinct = element.attribute("isDistinct").as_bool();
    info.group = attribute(element, "group");
    info.listType = attribute(element, "listType");
    for (const auto& entry : element.children("list_entry"))
        info.choices.push_back(textOf(entry));
    info.min = number(element, "min");
    info.max = number(element, "max");
    info.disabledBy = attribute(element, "disable_list_id");
    return info;
}

/// The disabling entry is given by its place in the other parameter's list.
void resolveDisablingValue(const pugi::xml_node& element, Description& description,
                           ParameterInfo& info) {
    if (info.disabledBy.empty()) return;
    const ParameterInfo* other = description.parameter(info.disabledBy);
    const auto place = element.attribute("disable_list_entry").as_ullong();
    if (other != nullptr && place < other->choices.size()) {
        info.disablingValue = other->choices[place];
    }
}

void readParameters(const pugi::xml_node& section, Description& description) {
    for (const auto& element : section.children("parameter")) {
        description.parameters.push_back(parameterOf(element));
    }
    std::size_t index = 0;
    for (const auto& element : section.children("parameter")) {
        resolveDisablingValue(element, description, description.parameters[index++]);
    }
}

AreaInfo areaOf(const pugi::xml_node& element) {
    return {.name = textOf(element),
            .display = attribute(element, "display"),
            .naturalType = attribute(element, "naturalType"),
            .types = element.attribute("icomTypes").as_uint(),
            .bitWrite = element.attribute("canBitWrite").as_bool(),
            .bitArrayWrite = element.attribute("canBitArrayWrite").as_bool(),
            .bitRead = element.attribute("mustBitRead").as_bool(),
            .readOnly = element.attribute("isReadOnly").as_bool(),
            .readCount = element.attribute("blockReadCount").as_int(),
            .writeCount = element.attribute("blockWriteCount").as_int(),
            .min = number(element, "min").value_or(0),
            .max = number(element, "max").value_or(0)};
}

ModelInfo modelOf(const pugi::xml_node& element) {
    ModelInfo info{textOf(element), attribute(element, "display"), {}};
    for (const auto& offer : element.children("memtype_ref")) {
        info.offers.push_back(
            {textOf(offer), number(offer, "min").value_or(0), number(offer, "max").value_or(0)});
    }
    return info;
}

/// The elements in front of the sections are facts: a name and a text.
void readFacts(const pugi::xml_node& root, Description& description) {
    for (const auto& element : root.children()) {
        if (element.type() != pugi::node_element) continue;
        if (!element
                 .find_child([](const auto& child) { return child.type() == pugi::node_element; })
                 .empty()) {
            continue;
        }
        if (element.first_attribute().empty()) {
            description.facts.emplace_back(element.name(), textOf(element));
        }
    }
}

template <class Rows, class Member>
auto find(const Rows& rows, Member member, std::string_view wanted) {
    const auto row = std::find_if(rows.begin(), rows.end(),
                                  [&](const auto& each) { return each.*member == wanted; });
    return row != rows.end() ? &*row : nullptr;
}

}  // namespace

bool ParameterInfo::isNumber() const {
    return type == "prop_integer" || type == "prop_nodeRef" || listType == "prop_integer";
}

const ParameterInfo* Description::parameter(std::string_view key) const {
    return find(parameters, &ParameterInfo::key, key);
}

const AreaInfo* Description::area(std::string_view name) const {
    return find(areas, &AreaInfo::name, name);
}

const ModelInfo* Description::model(std::string_view name) const {
    return find(models, &ModelInfo::name, name);
}

const ConversionInfo* Description::conversion(std::string_view name) const {
    return find(conversions, &ConversionInfo::name, name);
}

std::string Description::fact(std::string_view name) const {
    for (const auto& [key, value] : facts) {
        if (key == name) return value;
    }
    return {};
}

Description parseDescription(const std::string& document) {
    pugi::xml_document xml;
    const pugi::xml_parse_result parsed = xml.load_buffer(document.data(), document.size());
    if (!parsed) {
        throw DescriptionError("the driver's description is malformed at byte " +
                               std::to_string(parsed.offset) + ": " + parsed.description());
    }
    const pugi::xml_node root = xml.child("protocol_cfg");
    if (root.empty()) {
        throw DescriptionError("the driver's description has no <protocol_cfg>");
    }

    Description description;
    readFacts(root, description);
    readParameters(root.child("parameters"), description);
    for (const auto& area : root.child("memtypes").children("memtype")) {
        description.areas.push_back(areaOf(area));
    }
    for (const auto& field : root.child("tag_uri").children("tag_field")) {
        description.tagFields.push_back(
            {textOf(field), attribute(field, "display"), attribute(field, "default")});
    }
    for (const auto& model : root.child("models").children("model")) {
        description.models.push_back(modelOf(model));
    }
    for (const auto& conversion : root.child("conversions").children("conversion")) {
        description.conversions.push_back({textOf(conversion), attribute(conversion, "display"),
                                           conversion.attribute("icomTypes").as_uint()});
    }
    return description;
}

}  // namespace settings
