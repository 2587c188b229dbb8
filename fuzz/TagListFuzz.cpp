// Any text as a list of tags: each complaint has its place, and what is not complained of is whole.
#include <algorithm>
#include <cstdlib>
#include <string>

#include "poll/TagList.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    const auto lines = 1 + std::count(text.begin(), text.end(), '\n');
    const poll::TagList list = poll::parseTagList(text, "fuzz");
    for (const poll::ListComplaint& each : list.complaints) {
        const bool placed = each.line >= 1 && each.line <= lines && each.column >= 1;
        if (!placed || each.text.empty() || each.rule == nullptr) std::abort();
    }
    if (list.tags.empty() && list.complaints.empty()) std::abort();
    for (const poll::ListedTag& tag : list.tags) {
        if (tag.name.empty() || tag.uri.empty() || tag.line < 1 || tag.line > lines) std::abort();
        if (tag.period && tag.period->count() < 1) std::abort();
        if (tag.scale == 0.0) std::abort();
    }
    return 0;
}
