#include "poll/Poller.h"

#include <algorithm>
#include <map>
#include <stdexcept>

#include "poll/LinePoller.h"

namespace poll {

namespace {

using Line = std::shared_ptr<LinePoller>;

Line lineNamed(const std::vector<Line>& lines, const std::string& name) {
    const auto found = std::find_if(lines.begin(), lines.end(),
                                    [&](const Line& line) { return line->setup()->name == name; });
    return found == lines.end() ? nullptr : *found;
}

/// @return the index in `names`; their number when there is no such name.
std::size_t indexOf(const std::vector<std::string>& names, const std::string& name) {
    return static_cast<std::size_t>(std::find(names.begin(), names.end(), name) - names.begin());
}

/// What is known of the tags that both lines have.
KnownTags knownTo(const LinePoller& old, const LineSetup& setup) {
    std::map<std::string, std::size_t> places;
    for (std::size_t tag = 0; tag < setup.tagNames.size(); ++tag)
        places[setup.tagNames[tag]] = tag;
    const Snapshot last = old.snapshot();
    KnownTags known;
    for (std::size_t tag = 0; tag < last.tags.size(); ++tag) {
        const auto place = places.find(old.setup()->tagNames[tag]);
        if (place != places.end() && setup.uris[place->second] == old.setup()->uris[tag])
            known.emplace_back(place->second, last.tags[tag]);
    }
    return known;
}

}  // namespace

Poller::Poller(SourceFactory factory, Clock& clock, FaultReport report)
    : factory_(std::move(factory)), clock_(clock), report_(std::move(report)) {}

Poller::~Poller() {
    stop();
}

std::optional<std::string> Poller::reload(std::vector<LineSetup> setups) {
    if (std::optional<std::string> complaint = complaintAbout(setups)) return complaint;
    try {
        apply(compare(std::move(setups)));
    } catch (const std::runtime_error& refusal) {
        return refusal.what();
    }
    return {};
}

// Everything that can fail happens here, while the old lines go on.
Poller::Change Poller::compare(std::vector<LineSetup> setups) const {
    Change change;
    const std::vector<Line> old = lines();
    for (LineSetup& setup : setups) {
        Line line = lineNamed(old, setup.name);
        if (!line || !sameWork(*line->setup(), setup)) {
            std::unique_ptr<BlockSource> source = factory_(setup);
            line =
                std::make_shared<LinePoller>(std::move(setup), std::move(source), clock_, report_);
            change.added.push_back(line);
        }
        change.lines.push_back(std::move(line));
    }
    for (const Line& line : old)
        if (std::find(change.lines.begin(), change.lines.end(), line) == change.lines.end())
            change.dropped.push_back(line);
    return change;
}

// The old line leaves the port before the new one opens it.
void Poller::apply(Change change) {
    for (const Line& line : change.dropped)
        line->stop();
    for (const Line& line : change.added)
        if (const Line old = lineNamed(change.dropped, line->setup()->name))
            line->adopt(knownTo(*old, *line->setup()));
    {
        const std::lock_guard lock(mutex_);
        lines_ = std::move(change.lines);
    }
    for (const Line& line : change.added)
        line->start();
}

void Poller::stop() {
    for (const Line& line : lines())
        line->stop();
}

std::vector<Poller::Line> Poller::lines() const {
    const std::lock_guard lock(mutex_);
    return lines_;
}

std::vector<LineView> Poller::snapshot() const {
    std::vector<LineView> views;
    for (const Line& line : lines())
        views.push_back({line->setup(), line->snapshot()});
    return views;
}

WriteResult Poller::write(const std::string& tagName, std::vector<std::uint8_t> value) {
    for (const Line& line : lines()) {
        const std::size_t tag = indexOf(line->setup()->tagNames, tagName);
        if (tag < line->setup()->tagNames.size()) return line->write(tag, std::move(value));
    }
    std::promise<WriteOutcome> unknown;
    unknown.set_value(ReadError{-1, "No tag is named " + tagName});
    return unknown.get_future();
}

}  // namespace poll
