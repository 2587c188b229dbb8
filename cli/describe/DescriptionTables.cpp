// Each part of a description as a table.
#include "cli/describe/DescriptionTables.h"

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "cli/describe/TextTable.h"
#include "values/TypeMask.h"

namespace cli {
namespace {

using settings::AreaInfo;
using settings::Description;
using settings::ModelInfo;
using settings::ParameterInfo;

using Rows = std::vector<std::vector<std::string>>;

std::string presetText(const ParameterInfo& parameter) {
    if (parameter.mandatory) return "required";
    const std::string value = parameter.defaultValue.value_or(parameter.preset);
    return value.empty() ? "empty" : value;
}

std::string valuesText(const Description& description, const ParameterInfo& parameter) {
    std::string text = "text";
    if (!parameter.choices.empty()) {
        text = fmt::format("{}", fmt::join(parameter.choices, ", "));
    } else if (parameter.type == "prop_modelRef") {
        std::vector<std::string_view> names;
        for (const ModelInfo& model : description.models)
            names.push_back(model.name);
        text = fmt::format("{}", fmt::join(names, ", "));
    } else if (parameter.min && parameter.max) {
        text = fmt::format("{}..{}", *parameter.min, *parameter.max);
    } else if (parameter.isNumber()) {
        text = "a number";
    }
    if (!parameter.disabledBy.empty()) {
        text += fmt::format("; not with {}={}", parameter.disabledBy, parameter.disablingValue);
    }
    return text;
}

std::string givenFor(const ParameterInfo& parameter) {
    if (parameter.distinct) return "each node";
    return parameter.ofNode ? "node or all" : "all";
}

std::string rangeText(long min, long max) {
    return fmt::format("{}..{}", min, max);
}

std::string accessText(const AreaInfo& area) {
    return area.readOnly ? "read" : "read, write";
}

std::string displayOf(const Description& description, const std::string& area) {
    const AreaInfo* info = description.area(area);
    return info != nullptr ? info->display : std::string();
}

}  // namespace

std::string parametersText(const Description& description) {
    Rows rows{{"KEY", "MEANING", "GIVEN FOR", "DEFAULT", "SUGGESTED", "VALUES"}};
    for (const ParameterInfo& parameter : description.parameters) {
        rows.push_back({parameter.key, parameter.display, givenFor(parameter),
                        presetText(parameter), parameter.preset,
                        valuesText(description, parameter)});
    }
    return textTable(rows);
}

std::string modelsText(const Description& description) {
    std::string text;
    for (const ModelInfo& model : description.models) {
        if (!text.empty()) text += '\n';
        text += fmt::format("model {}: {}\n", model.name, model.display);
        Rows rows{{"  AREA", "ADDRESSES", "MEANING"}};
        for (const settings::AreaOffer& offer : model.offers) {
            rows.push_back({"  " + offer.area, rangeText(offer.min, offer.max),
                            displayOf(description, offer.area)});
        }
        text += textTable(rows);
    }
    return text;
}

std::string memoryText(const Description& description) {
    Rows rows{{"AREA", "MEANING", "ITEM", "ACCESS", "READ MAX", "WRITE MAX", "DATA TYPES"}};
    for (const AreaInfo& area : description.areas) {
        rows.push_back({area.name, area.display, area.naturalType, accessText(area),
                        std::to_string(area.readCount), std::to_string(area.writeCount),
                        values::typesText(area.types)});
    }
    return textTable(rows);
}

std::string conversionsText(const Description& description) {
    Rows rows{{"NAME", "EFFECT", "DATA TYPES"}};
    for (const settings::ConversionInfo& conversion : description.conversions) {
        rows.push_back({conversion.name, conversion.display, values::typesText(conversion.types)});
    }
    return textTable(rows);
}

std::string descriptionText(const Description& description) {
    std::vector<std::string_view> fields;
    for (const settings::TagFieldInfo& field : description.tagFields)
        fields.push_back(field.name);
    return fmt::format(
        "{} ({}), protocol code {}\n"
        "\nA tag is {}.\n"
        "\nParameters of a configuration\n\n{}\nModels\n\n{}\nMemory\n\n{}\nConversions\n\n{}",
        description.fact("display"), description.fact("name"), description.fact("code"),
        fmt::join(fields, "?"), parametersText(description), modelsText(description),
        memoryText(description), conversionsText(description));
}

}  // namespace cli
