// The rules about what can never work: the driver accepts the tag and then refuses each access, or
// sends something else than was meant.
#include <fmt/format.h>

#include <algorithm>

#include "lint/LintTags.h"
#include "lint/NodeNumber.h"
#include "lint/TagSpan.h"
#include "settings/NumberText.h"
#include "settings/ReadLimits.h"
#include "values/ValueTypes.h"

namespace lint {
namespace {

using settings::AreaInfo;
using settings::AreaOffer;

constexpr std::size_t kNodeField = 0;
constexpr std::size_t kAddressField = 2;
constexpr std::size_t kTypeField = 3;
constexpr int kBitsOfAByte = 8;

bool isOfBits(const TagFacts& facts) {
    return facts.type == ICU_Type::boolean || facts.type == ICU_Type::booleanArray;
}

void emptyTag(const TagLine& tag, const TagSurroundings& /*around*/, Findings& out) {
    if (tag.facts->length > 0) return;
    out.push_back({Severity::Error, "empty-tag", tag.placeOf(kTypeField),
                   fmt::format("'{}' has no length: every access will fail", tag.dataType()),
                   fmt::format("write how many, e.g. {}16", dataTypeText(tag.dataType()).name)});
}

void negativeSubIndex(const TagLine& tag, const TagSurroundings& /*around*/, Findings& out) {
    const auto subIndex = tag.subIndex();
    if (!subIndex || !isOfBits(*tag.facts) || settings::readNumber(*subIndex).value >= 0) return;
    out.push_back({Severity::Error, "negative-subindex", tag.placeOf(kAddressField),
                   fmt::format("the sub-index '{}' is negative: every access will fail", *subIndex),
                   "bits count from 0, the least significant one of the first item"});
}

void outsideArea(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const AreaInfo* area = around.description.area(tag.area());
    if (area == nullptr || settings::isOfDriver(*area) || tag.facts->length <= 0) return;
    const AreaOffer offer = settings::offerOf(*area, around.modelOf(tag.facts->node));
    const TagSpan span = tagSpan(*tag.facts, *area);
    if (span.endItem() <= offer.max - offer.min + 1) return;
    out.push_back(
        {Severity::Error, "outside-area", tag.placeOf(kAddressField),
         fmt::format("the tag reaches to {} {}, beyond the area's last address, {}: every access "
                     "will fail",
                     offer.area, offer.min + span.endItem() - 1, offer.max),
         "check the address and the length"});
}

void unusableNode(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const AreaInfo* area = around.description.area(tag.area());
    if (area != nullptr && settings::isOfDriver(*area)) return;
    const std::string fault = nodeFault(settings::readNumber(tag.node()).value);
    if (fault.empty()) return;
    warn(out, "unusable-node", tag.placeOf(kNodeField), fault, kUsableNodes);
}

/// Function 5 writes coil by coil, and the driver looks at the first byte of the values only.
void repeatedCoils(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const AreaInfo* area = around.description.area(tag.area());
    const TagFacts& facts = *tag.facts;
    if (area == nullptr || !area->bitArrayWrite || facts.readOnly) return;
    if (facts.type != ICU_Type::booleanArray || around.coilFunctionOf(facts.node) == "15") return;
    const int inFirstByte = kBitsOfAByte - facts.bitIndex % kBitsOfAByte;
    if (facts.length <= inFirstByte) return;
    warn(out, "repeated-coils", tag.placeOf(kTypeField),
         fmt::format("with forceFunction={} only the first {} of {} coils are written with their "
                     "own values; the others repeat them",
                     around.coilFunctionOf(facts.node), inFirstByte, facts.length),
         "set forceFunction=15, or write arrays that end with the eighth coil of a group");
}

constexpr void (*kRules[])(const TagLine&, const TagSurroundings&, Findings&) = {
    emptyTag, negativeSubIndex, outsideArea, unusableNode, repeatedCoils,
};

}  // namespace

void lintAccess(const TagLine& tag, const TagSurroundings& surroundings, Findings& out) {
    for (const auto rule : kRules)
        rule(tag, surroundings, out);
}

}  // namespace lint
