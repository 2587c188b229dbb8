// What to say when the driver refuses a tag: the field to blame and what it may hold.
#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <optional>

#include "lint/LintTags.h"
#include "settings/NumberText.h"
#include "values/NearestName.h"
#include "values/TypeMask.h"
#include "values/ValueTypes.h"

namespace lint {
namespace {

using settings::AreaOffer;
using settings::Description;
using settings::ModelInfo;

using values::ValueType;

struct Blame {
    std::size_t field;
    std::string suggestion;
};

using Verdict = std::optional<Blame>;

Verdict emptyField(const TagLine& tag, const Description& description) {
    for (std::size_t i = 0; i < tag.fields.size(); ++i) {
        if (!tag.fields[i].text.empty()) continue;
        const std::string name =
            i < description.tagFields.size() ? description.tagFields[i].name : "field";
        return Blame{i, fmt::format("fill in the {}", name)};
    }
    return std::nullopt;
}

Verdict wrongArea(const TagLine& tag, const ModelInfo* model, const Description& description) {
    if (model == nullptr) return std::nullopt;
    const auto offered = [&](const AreaOffer& offer) { return offer.area == tag.area(); };
    if (std::any_of(model->offers.begin(), model->offers.end(), offered)) return std::nullopt;
    std::vector<std::string> names;
    for (const AreaOffer& offer : model->offers)
        names.push_back(offer.area);
    const std::string nearest = values::nearestName(tag.area(), names);
    // What the model lacks is not to blame when the driver knows the area all the same.
    const bool elsewhere = description.area(tag.area()) != nullptr;
    if (!elsewhere && !nearest.empty()) {
        return Blame{1, fmt::format("did you mean '{}'?", nearest)};
    }
    return Blame{1, fmt::format("model {} offers {}", model->name, fmt::join(names, ", "))};
}

Verdict unknownType(const TagLine& tag) {
    const std::string name = dataTypeText(tag.dataType()).name;
    if (values::typeNamed(name) != nullptr) return std::nullopt;
    std::vector<std::string> names;
    names.reserve(values::kValueTypes.size());
    for (const ValueType& row : values::kValueTypes)
        names.emplace_back(row.name);
    const std::string nearest = values::nearestName(name, names);
    return Blame{3, nearest.empty() ? "'mrtu describe memory' lists the data types"
                                    : fmt::format("did you mean '{}'?", nearest)};
}

Verdict outOfRange(const TagLine& tag, const ModelInfo* model) {
    if (model == nullptr) return std::nullopt;
    const long address = settings::readNumber(tag.address()).value;
    for (const AreaOffer& offer : model->offers) {
        if (offer.area != tag.area() || (address >= offer.min && address <= offer.max)) continue;
        return Blame{2, fmt::format("model {} has {} {}..{}", model->name, offer.area, offer.min,
                                    offer.max)};
    }
    return std::nullopt;
}

Verdict unsuitableType(const TagLine& tag, const Description& description) {
    const settings::AreaInfo* area = description.area(tag.area());
    const ValueType* type = values::typeNamed(dataTypeText(tag.dataType()).name);
    if (area == nullptr || type == nullptr) return std::nullopt;
    const auto row = static_cast<std::uint32_t>(type->type) - 1;
    if ((area->types >> row & 1U) != 0) return std::nullopt;
    return Blame{3, fmt::format("{} takes {}", area->name, values::typesText(area->types))};
}

Verdict blameOf(const TagLine& tag, const TagSurroundings& around) {
    if (!tag.wellFormed()) {
        std::vector<std::string> names;
        for (const settings::TagFieldInfo& field : around.description.tagFields)
            names.push_back(field.name);
        return Blame{0, fmt::format("write {}", fmt::join(names, "?"))};
    }
    if (auto blame = emptyField(tag, around.description)) return blame;
    const ModelInfo* model =
        around.modelOf(static_cast<int>(settings::readNumber(tag.node()).value));
    // First what names something that does not exist, then what does not fit together.
    if (around.description.area(tag.area()) == nullptr) {
        return wrongArea(tag, model, around.description);
    }
    if (auto blame = unknownType(tag)) return blame;
    if (auto blame = outOfRange(tag, model)) return blame;
    if (auto blame = unsuitableType(tag, around.description)) return blame;
    return wrongArea(tag, model, around.description);
}

}  // namespace

Finding tagRefusal(const TagLine& tag, const TagSurroundings& surroundings,
                   const std::string& message) {
    if (!tag.orderRefusal.empty()) {
        return {Severity::Error, "refused", tag.placeOf(3), tag.orderRefusal, {}};
    }
    const Verdict blame = blameOf(tag, surroundings);
    return {Severity::Error, "refused", tag.placeOf(blame ? blame->field : 0), message,
            blame ? blame->suggestion : std::string()};
}

}  // namespace lint
