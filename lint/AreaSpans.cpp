#include "lint/AreaSpans.h"

#include <fmt/format.h>

namespace lint {
namespace {

using settings::AreaInfo;

Span spanOf(const TagLine& tag, std::size_t order, const AreaInfo& area) {
    return {tagSpan(*tag.facts, area), &tag, order, tag.facts->readOnly};
}

}  // namespace

std::map<Area, std::vector<Span>> spansByArea(const std::vector<TagLine>& tags,
                                              const settings::Description& description) {
    std::map<Area, std::vector<Span>> areas;
    for (std::size_t i = 0; i < tags.size(); ++i) {
        if (!tags[i].wellFormed() || !tags[i].facts) continue;
        const AreaInfo* area = description.area(tags[i].area());
        if (area == nullptr) continue;
        areas[{tags[i].facts->node, area->name}].push_back(spanOf(tags[i], i, *area));
    }
    return areas;
}

std::string placed(const Span& span) {
    return fmt::format("'{}' ({}:{})", span.tag->uri, span.tag->place.source, span.tag->place.line);
}

}  // namespace lint
