#include "tests/unit/lint/Samples.h"

namespace lint {
namespace {

using settings::AreaInfo;
using settings::Description;
using settings::ParameterInfo;

ParameterInfo number(const std::string& key, const std::string& preset, bool ofNode) {
    ParameterInfo info{};
    info.key = key;
    info.type = "prop_integer";
    info.preset = preset;
    info.defaultValue = preset;
    info.ofNode = ofNode;
    return info;
}

ParameterInfo list(const std::string& key, const std::string& preset, const std::string& listType,
                   const std::vector<std::string>& choices) {
    ParameterInfo info{};
    info.key = key;
    info.type = "prop_list";
    info.preset = preset;
    info.mandatory = true;
    info.listType = listType;
    info.choices = choices;
    return info;
}

AreaInfo area(const std::string& name, const std::string& natural, std::uint32_t types,
              bool readOnly, long min, long max) {
    AreaInfo info{};
    info.name = name;
    info.naturalType = natural;
    info.types = types;
    info.bitRead = natural == "boolean";
    info.bitArrayWrite = info.bitRead && !readOnly;
    info.readCount = info.bitRead ? 2000 : 125;
    info.readOnly = readOnly;
    info.min = min;
    info.max = max;
    return info;
}

Description makeDescription() {
    Description description;
    description.parameters = {
        number("defNodeId", "1", true),
        number("timeout", "2000", true),
        number("maxOptLen", "250", true),
        list("txMode", "RTU", "prop_string", {"RTU", "ASCII"}),
        list("uart", "com1", "prop_string", {"com1", "com2"}),
        list("parity", "even", "prop_string", {"none", "even", "odd"}),
        list("bits", "8", "prop_integer", {"7", "8"}),
        list("stopbits", "1", "prop_integer", {"1", "2"}),
        list("presetFunction", "16", "prop_string", {"06", "16"}),
        list("forceFunction", "15", "prop_string", {"05", "15"}),
    };
    ParameterInfo model = number("model", "1", true);
    model.type = "prop_modelRef";
    description.parameters.push_back(model);
    description.parameters[2].min = 0;
    description.parameters[2].max = 250;
    description.parameters[3].mandatory = false;
    description.parameters[3].defaultValue = "RTU";
    description.parameters[6].disabledBy = "txMode";
    description.parameters[6].disablingValue = "RTU";
    description.areas = {
        area("OUTP", "boolean", 0x1001, false, 1, 65536),
        area("HREG", "unsignedShort", 0x3dff7ff, false, 400001, 465536),
        area("IREG", "unsignedShort", 0x3dff7ff, true, 300001, 365536),
        area("LONG", "unsignedInt", 0xc80c8, false, 0, 65535),
        area("NO", "unsignedByte", 0x10, false, 0, 1),
    };
    description.areas.back().readCount = 1;
    description.tagFields = {{"nodeid", "", ""},
                             {"memorytype", "", ""},
                             {"arrayindex.subindex", "", ""},
                             {"datatype", "", ""}};
    description.models = {
        {"1", "", {{"OUTP", 1, 65536}, {"HREG", 400001, 465536}, {"IREG", 300001, 365536}}},
        {"3", "", {{"OUTP", 1, 65536}, {"HREG", 400001, 465536}, {"LONG", 0, 65535}}},
    };
    description.conversions = {{"swap2", "", 0x3fecbec},
                               {"swap4", "", 0x3dc81c8},
                               {"bcd", "", 0x7e07e},
                               {"neg", "", 0x298e18e}};
    return description;
}

}  // namespace

const Description& sampleDescription() {
    static const Description description = makeDescription();
    return description;
}

TagLine acceptedTag(const std::string& uri, int line, unsigned byteOffset, int bitIndex,
                    ICU_Type type, int length, ICU_Type itemType) {
    TagLine tag = tagLine(uri, "tags", line, 1);
    const bool readOnly = tag.area() == "IREG";
    tag.facts = TagFacts{.node = 1,
                         .byteOffset = byteOffset,
                         .bitIndex = bitIndex,
                         .type = type,
                         .itemType = itemType,
                         .length = length,
                         .readOnly = readOnly,
                         .conversions = {}};
    return tag;
}

std::string placesOf(const Findings& findings) {
    std::string text;
    for (const Finding& finding : findings) {
        if (!text.empty()) text += ' ';
        text += finding.rule + '@' + std::to_string(finding.place.line) + ':' +
                std::to_string(finding.place.column);
    }
    return text;
}

}  // namespace lint
