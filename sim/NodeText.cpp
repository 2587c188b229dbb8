#include "sim/NodeText.h"

#include <algorithm>
#include <array>
#include <utility>

#include "sim/TextNumbers.h"

namespace sim {
namespace {

constexpr Nanos kMillisecond = std::chrono::milliseconds(1);
constexpr Nanos kSecond = std::chrono::seconds(1);

struct AreaWord {
    std::string_view word;
    Area area;
};

/// The words that tags have for the areas.
constexpr std::array kAreaWords{
    AreaWord{"OUTP", Area::Coil},
    AreaWord{"INP", Area::DiscreteInput},
    AreaWord{"HREG", Area::HoldingRegister},
    AreaWord{"IREG", Area::InputRegister},
};

/// @return the text before the separator; `rest` becomes the one behind it, nothing without one.
std::string_view cut(std::string_view text, std::string_view separator,
                     std::optional<std::string_view>& rest) {
    const std::size_t at = text.find(separator);
    rest.reset();
    if (at != std::string_view::npos) rest = text.substr(at + separator.size());
    return text.substr(0, at);
}

/// Takes the node off the text's front. @return whether what stood there was one, or nothing.
bool takeNode(std::string_view& text, std::optional<std::uint8_t>& node) {
    std::optional<std::string_view> rest;
    const std::string_view front = cut(text, ":", rest);
    const bool hasNode = rest && !front.empty() && front[0] >= '0' && front[0] <= '9';
    if (!hasNode) return true;
    text = *rest;
    return readNumber<std::uint8_t>(front, 1, 255, node.emplace());
}

bool read(std::string_view text, Turnaround& turnaround) {
    std::optional<std::string_view> most;
    std::optional<std::string_view> growth;
    const std::string_view least = cut(cut(text, "..", most), "+", growth);
    if (!readTime(least, kMillisecond, turnaround.least)) return false;
    turnaround.most = growth ? kLongestTime : turnaround.least;
    if (growth && !readTime(*growth, kMillisecond, turnaround.growth)) return false;
    if (most && !readTime(*most, kMillisecond, turnaround.most)) return false;
    // Without it the end would mean a jitter.
    if (growth && turnaround.growth == Nanos(0)) turnaround.most = turnaround.least;
    return turnaround.most >= turnaround.least;
}

bool read(std::string_view text, Presence& presence) {
    std::optional<std::string_view> away;
    const std::string_view there = cut(text, "/", away);
    return away && readTime(there, kSecond, presence.there) &&
           readTime(*away, kSecond, presence.away) && presence.there + presence.away > Nanos(0);
}

bool read(std::string_view text, RefusedRange& range) {
    std::optional<std::string_view> addresses;
    std::optional<std::string_view> last;
    const std::string_view word = cut(text, ":", addresses);
    const auto* const row = std::find_if(kAreaWords.begin(), kAreaWords.end(),
                                         [&](const AreaWord& each) { return each.word == word; });
    if (row == kAreaWords.end() || !addresses) return false;
    const std::string_view first = cut(*addresses, "-", last);
    range.area = row->area;
    return readNumber<std::uint32_t>(first, 0, 65535, range.first) &&
           readNumber<std::uint32_t>(last.value_or(first), range.first, 65535, range.last);
}

template <typename Behaviour>
std::optional<ForNodes<Behaviour>> parse(std::string_view text, const char* forms,
                                         std::string& error) {
    ForNodes<Behaviour> result;
    std::string_view rest = text;
    if (takeNode(rest, result.node) && read(rest, result.behaviour)) return result;
    error = "not " + std::string(forms) + ", with NODE: in front for one node";
    return std::nullopt;
}

}  // namespace

std::optional<ForNodes<Turnaround>> parseTurnaround(std::string_view text, std::string& error) {
    return parse<Turnaround>(
        text, "MS, LEAST..MOST, FIRST+STEP or FIRST+STEP..MOST (ms, at most an hour)", error);
}

std::optional<ForNodes<Presence>> parsePresence(std::string_view text, std::string& error) {
    return parse<Presence>(text, "THERE/AWAY (s, at most an hour each, not both 0)", error);
}

std::optional<ForNodes<RefusedRange>> parseRefusedRange(std::string_view text, std::string& error) {
    return parse<RefusedRange>(
        text, "AREA:FIRST[-LAST] (OUTP, INP, HREG or IREG; addresses from 0 to 65535)", error);
}

}  // namespace sim
