// Each part of a description as a JSON value.
#include "cli/describe/DescriptionJson.h"

#include "values/TypeMask.h"

namespace cli {
namespace {

using settings::AreaInfo;
using settings::Description;
using settings::ParameterInfo;

using values::Json;

Json typesJson(std::uint32_t mask) {
    Json names = Json::array();
    for (const std::string_view name : values::typeNames(mask))
        names.push_back(std::string(name));
    return names;
}

Json parameterJson(const ParameterInfo& parameter) {
    Json json{{"key", parameter.key},           {"display", parameter.display},
              {"type", parameter.type},         {"suggested", parameter.preset},
              {"perNode", parameter.ofNode},    {"required", parameter.mandatory},
              {"distinct", parameter.distinct}, {"group", parameter.group}};
    if (parameter.defaultValue) json["default"] = *parameter.defaultValue;
    if (parameter.min) json["min"] = *parameter.min;
    if (parameter.max) json["max"] = *parameter.max;
    if (!parameter.choices.empty()) json["choices"] = parameter.choices;
    if (!parameter.disabledBy.empty()) {
        json["notWith"] = {{"key", parameter.disabledBy}, {"value", parameter.disablingValue}};
    }
    return json;
}

Json areaJson(const AreaInfo& area) {
    return {{"name", area.name},
            {"display", area.display},
            {"item", area.naturalType},
            {"types", typesJson(area.types)},
            {"readOnly", area.readOnly},
            {"bitWrite", area.bitWrite},
            {"bitArrayWrite", area.bitArrayWrite},
            {"bitRead", area.bitRead},
            {"readCount", area.readCount},
            {"writeCount", area.writeCount},
            {"min", area.min},
            {"max", area.max}};
}

}  // namespace

Json parametersJson(const Description& description) {
    Json json = Json::array();
    for (const ParameterInfo& parameter : description.parameters) {
        json.push_back(parameterJson(parameter));
    }
    return json;
}

Json modelsJson(const Description& description) {
    Json json = Json::array();
    for (const settings::ModelInfo& model : description.models) {
        Json offers = Json::array();
        for (const settings::AreaOffer& offer : model.offers) {
            offers.push_back({{"area", offer.area}, {"min", offer.min}, {"max", offer.max}});
        }
        json.push_back({{"name", model.name}, {"display", model.display}, {"offers", offers}});
    }
    return json;
}

Json memoryJson(const Description& description) {
    Json json = Json::array();
    for (const AreaInfo& area : description.areas)
        json.push_back(areaJson(area));
    return json;
}

Json conversionsJson(const Description& description) {
    Json json = Json::array();
    for (const settings::ConversionInfo& conversion : description.conversions) {
        json.push_back({{"name", conversion.name},
                        {"display", conversion.display},
                        {"types", typesJson(conversion.types)}});
    }
    return json;
}

Json descriptionJson(const Description& description) {
    Json facts = Json::object();
    for (const auto& [name, value] : description.facts)
        facts[name] = value;
    Json fields = Json::array();
    for (const settings::TagFieldInfo& field : description.tagFields) {
        fields.push_back(
            {{"name", field.name}, {"display", field.display}, {"suggested", field.preset}});
    }
    return {{"facts", facts},
            {"parameters", parametersJson(description)},
            {"memory", memoryJson(description)},
            {"tagFields", fields},
            {"models", modelsJson(description)},
            {"conversions", conversionsJson(description)}};
}

}  // namespace cli
