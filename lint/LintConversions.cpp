// The rules about conversions: what a conversion can't do is found when the tag is read or written,
// not before.
#include <fmt/format.h>
#include <fmt/ranges.h>

#include "lint/LintTags.h"
#include "values/NearestName.h"
#include "values/TypeMask.h"
#include "values/ValueTypes.h"

namespace lint {
namespace {

using settings::ConversionInfo;

constexpr std::size_t kTypeField = 3;

Finding unknownConversion(const TagLine& tag, const settings::Description& description,
                          const std::string& name) {
    std::vector<std::string> names;
    for (const ConversionInfo& each : description.conversions)
        names.push_back(each.name);
    const std::string nearest = values::nearestName(name, names);
    return {Severity::Error, "unknown-conversion", tag.placeOf(kTypeField),
            fmt::format("unknown conversion '{}': every access will fail", name),
            nearest.empty() ? fmt::format("choices: {}", fmt::join(names, ", "))
                            : fmt::format("did you mean '{}'?", nearest)};
}

/// What the driver says of the conversion: not in this direction, or not of all items.
bool impossibleConversion(const TagLine& tag, const ConversionFacts& facts, Findings& out) {
    const bool writes = facts.writes || tag.facts->readOnly;
    if (facts.reads && writes) return false;
    const char* const fails =
        facts.reads ? "every write" : (facts.writes ? "every read" : "every access");
    const bool never = !facts.reads && (!facts.writes || tag.facts->readOnly);
    out.push_back({never ? Severity::Error : Severity::Warning, "impossible-conversion",
                   tag.placeOf(kTypeField),
                   fmt::format("conversion '{}' can't be applied to {}: {} will fail", facts.name,
                               values::typeName(
                                   {tag.facts->type, static_cast<std::size_t>(tag.facts->length)}),
                               fails),
                   "check the data type, its length and the conversion"});
    return true;
}

bool partialConversion(const TagLine& tag, const ConversionFacts& facts, Findings& out) {
    if (facts.changedItems == 0 || facts.changedItems == facts.items) return false;
    warn(out, "partial-conversion", tag.placeOf(kTypeField),
         fmt::format("conversion '{}' reaches only the first {} of {} items", facts.name,
                     facts.changedItems, facts.items),
         "make a tag of each item");
    return true;
}

bool unsuitableConversion(const TagLine& tag, const ConversionInfo& conversion,
                          const std::string& type, Findings& out) {
    if ((conversion.types & values::typeMask(type)) != 0) return false;
    warn(out, "unsuitable-conversion", tag.placeOf(kTypeField),
         fmt::format("conversion '{}' is not meant for the data type {}", conversion.name, type),
         "'mrtu describe conversions' lists the data types");
    return true;
}

const ConversionFacts* factsOf(const TagLine& tag, const std::string& name) {
    for (const ConversionFacts& facts : tag.facts->conversions) {
        if (facts.name == name) return &facts;
    }
    return nullptr;
}

}  // namespace

void lintConversions(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const DataTypeText type = dataTypeText(tag.dataType());
    for (const std::string& name : type.conversions) {
        const ConversionInfo* conversion = around.description.conversion(name);
        if (conversion == nullptr) {
            out.push_back(unknownConversion(tag, around.description, name));
            continue;
        }
        // The first that there is to say is the worst.
        const ConversionFacts* facts = factsOf(tag, name);
        if (facts != nullptr && impossibleConversion(tag, *facts, out)) continue;
        if (facts != nullptr && partialConversion(tag, *facts, out)) continue;
        unsuitableConversion(tag, *conversion, type.name, out);
    }
}

}  // namespace lint
