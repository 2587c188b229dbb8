// Asks the driver what it makes of a tag and of its conversions.
#include "cli/check/DriverFacts.h"

#include <algorithm>
#include <iterator>

#include "values/ValueTypes.h"

namespace cli {
namespace {

using lint::ConversionFacts;
using lint::TagFacts;

/// Longer values are beyond every area; nothing is tried on them.
constexpr int kLongestTrial = 1024 * 1024;
/// A one in every byte: true for bits, and valid digits for whatever takes bytes apart.
constexpr unsigned char kTrialByte = 1;

int itemBytes(const TagFacts& facts) {
    const ICU_Type item = facts.itemType == ICU_Type::none ? facts.type : facts.itemType;
    return std::max<int>(values::rowOf(item).bytes, 1);
}

/// @return how many items are no longer what they were.
int changedItems(const std::vector<unsigned char>& value, int bytes) {
    int changed = 0;
    for (auto at = value.begin(); value.end() - at >= bytes; at += bytes) {
        const auto same = [](unsigned char each) { return each == kTrialByte; };
        if (!std::all_of(at, at + bytes, same)) ++changed;
    }
    return changed;
}

ConversionFacts tryConversion(const ITag& tag, const TagFacts& facts, const std::string& name) {
    const std::vector<unsigned char> trial(static_cast<std::size_t>(facts.length), kTrialByte);
    std::vector<unsigned char> written = trial;
    std::vector<unsigned char> read = trial;
    const bool writes = tag.DoConversion(written.data(), name.c_str(), true);
    const bool reads = tag.DoConversion(read.data(), name.c_str(), false);
    const int bytes = itemBytes(facts);
    return {.name = name,
            .reads = reads,
            .writes = writes,
            .items = facts.length / bytes,
            .changedItems = reads ? changedItems(read, bytes) : 0};
}

std::vector<ConversionFacts> conversionsOf(const ITag& tag, const TagFacts& facts,
                                           const std::string& uri) {
    const lint::TagLine line = lint::tagLine(uri, {}, 1, 1);
    std::vector<ConversionFacts> conversions;
    if (!line.wellFormed() || facts.length <= 0 || facts.length > kLongestTrial) return conversions;
    const lint::DataTypeText type = lint::dataTypeText(line.dataType());
    for (const std::string& name : type.conversions)
        conversions.push_back(tryConversion(tag, facts, name));
    return conversions;
}

}  // namespace

std::optional<TagFacts> factsOf(IProtocol& protocol, const std::string& uri, std::string& refusal) {
    ITag* tag = protocol.CreateTag(uri.c_str());
    if (tag == nullptr) {
        refusal = protocol.GetLastErrorString();
        return std::nullopt;
    }
    const auto* nodes = static_cast<IProtocol4*>(protocol.ConvertTo("IProtocol4"));
    TagFacts facts{.node = nodes != nullptr ? nodes->GetNodeID(tag) : 0,
                   .byteOffset = tag->GetByteOffset(),
                   .bitIndex = tag->GetBitIndex(),
                   .type = tag->GetVarType(),
                   .itemType = tag->GetItemType(),
                   .length = tag->GetVarLength(),
                   .readOnly = tag->IsReadOnly(),
                   .conversions = {}};
    facts.conversions = conversionsOf(*tag, facts, uri);
    protocol.FreeTag(tag);
    return facts;
}

}  // namespace cli
