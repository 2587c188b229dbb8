// The rules that look at one tag.
#include <fmt/format.h>
#include <fmt/ranges.h>

#include "lint/LintTags.h"
#include "lint/TagSpan.h"
#include "settings/NumberText.h"

namespace lint {
namespace {

using settings::AreaInfo;

constexpr std::size_t kNodeField = 0;
constexpr std::size_t kAddressField = 2;

/// The areas' address ranges begin a hundred thousand apart; in the five-digit form, ten thousand.
constexpr long kDecade = 100000;
constexpr long kShortDecade = 10000;

void unnamedNode(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const int node = static_cast<int>(settings::readNumber(tag.node()).value);
    if (around.nodes.contains(node)) return;
    std::vector<std::string> names;
    for (const int each : around.nodes)
        names.push_back(std::to_string(each));
    warn(
        out, "unnamed-node", tag.placeOf(kNodeField),
        fmt::format(
            "the configuration does not name node {}; its parameters are those of all nodes", node),
        names.empty() ? fmt::format("give it parameters of its own: Node{}::...", node)
                      : fmt::format("named: {}", fmt::join(names, ", ")));
}

void oddNumber(const TagLine& tag, std::size_t field, const char* what, const std::string& text,
               Findings& out) {
    const settings::NumberReading number = settings::readNumber(text);
    if (number.octal) {
        warn(out, "octal-number", tag.placeOf(field),
             fmt::format("{} '{}' begins with a zero and is read as octal: {}", what, text,
                         number.value),
             fmt::format("write {} for the decimal number", settings::withoutLeadingZeroes(text)));
    } else if (number.partial) {
        warn(out, "not-a-number", tag.placeOf(field),
             fmt::format("{} '{}' is no number and is read as {}", what, text, number.value),
             "write a decimal number, or 0x and a hexadecimal one");
    }
}

void oddNumbers(const TagLine& tag, const TagSurroundings& /*around*/, Findings& out) {
    oddNumber(tag, kNodeField, "node", tag.node(), out);
    oddNumber(tag, kAddressField, "address", tag.address(), out);
    if (const auto subIndex = tag.subIndex()) {
        oddNumber(tag, kAddressField, "sub-index", *subIndex, out);
    }
}

bool hasFiveDigits(long address) {
    return address >= kShortDecade && address < kDecade;
}

/// Five digits in an area whose addresses have six: the short form of the first ten thousand items.
void shortAddress(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const AreaInfo* area = around.description.area(tag.area());
    const long address = settings::readNumber(tag.address()).value;
    if (area == nullptr || area->min < kDecade || !hasFiveDigits(address)) return;
    const long base = area->min / kDecade * kDecade;
    const long item = address - base / kDecade * kShortDecade;
    warn(out, "short-address", tag.placeOf(kAddressField),
         fmt::format("{} {} is taken as the five-digit form of {}, not as item {} of the area ({})",
                     tag.area(), address, base + item, address, base + address),
         fmt::format("write {} or {}", base + item, base + address));
}

/// Five digits in an area that begins at 0 or 1, as another area's short form would begin.
void foreignAddress(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const AreaInfo* area = around.description.area(tag.area());
    const long address = settings::readNumber(tag.address()).value;
    const bool low = area != nullptr && area->min < kShortDecade && area->max >= kShortDecade;
    if (!low || !area->bitRead || !hasFiveDigits(address)) return;
    for (const AreaInfo& other : around.description.areas) {
        if (other.min < kDecade || other.min / kDecade != address / kShortDecade) continue;
        warn(out, "foreign-address", tag.placeOf(kAddressField),
             fmt::format("{0} {1} is item {1} of {0}, although {1} looks like the five-digit form "
                         "of an address in {2}",
                         tag.area(), address, other.name),
             fmt::format(
                 "if {0} is meant, write {0} and the six-digit form {1}", other.name,
                 address - other.min / kDecade * kShortDecade + other.min / kDecade * kDecade));
        return;
    }
}

bool isBitType(ICU_Type type) {
    return type == ICU_Type::boolean || type == ICU_Type::booleanArray;
}

void ignoredSubIndex(const TagLine& tag, const TagSurroundings& around, Findings& out) {
    const auto subIndex = tag.subIndex();
    if (!tag.facts || !subIndex) return;
    const long bit = settings::readNumber(*subIndex).value;
    const AreaInfo* area = around.description.area(tag.area());
    const bool bitArea = area != nullptr && isBitArea(*area);
    // Nothing but a bit of a register has a number, and zero is what all others have anyway. A
    // negative one is worse than without effect where there are bits.
    const bool bits = isBitType(tag.facts->type);
    if (bit == 0 || (bits && (!bitArea || bit < 0))) return;
    warn(out, "ignored-subindex", tag.placeOf(kAddressField),
         fmt::format("the sub-index '.{}' has no effect: {}", *subIndex,
                     bitArea ? "an item of the area is a bit already"
                             : "the data type begins with a register's first byte"),
         bitArea ? fmt::format("write {}", tag.address())
                 : fmt::format("write {}, or a data type of bits", tag.address()));
}

constexpr void (*kRules[])(const TagLine&, const TagSurroundings&, Findings&) = {
    unnamedNode, oddNumbers, shortAddress, foreignAddress, ignoredSubIndex,
};

}  // namespace

Findings lintTag(const TagLine& tag, const TagSurroundings& surroundings) {
    Findings out;
    if (!tag.wellFormed() || !tag.facts) return out;
    for (const auto rule : kRules)
        rule(tag, surroundings, out);
    lintAccess(tag, surroundings, out);
    lintConversions(tag, surroundings, out);
    sortByPlace(out);
    return out;
}

}  // namespace lint
