#include "poll/FaultWatch.h"

#include <utility>

namespace poll {

FaultWatch::FaultWatch(std::string line, FaultReport report)
    : line_(std::move(line)), report_(std::move(report)) {}

void FaultWatch::fault(const std::string& subject, const std::string& text) {
    const auto [known, isNew] = texts_.try_emplace(subject, text);
    if (isNew) return tell(FaultEvent::Kind::Begins, subject, text);
    if (known->second == text) return;
    known->second = text;
    tell(FaultEvent::Kind::Changes, subject, text);
}

void FaultWatch::fine(const std::string& subject) {
    const auto known = texts_.find(subject);
    if (known == texts_.end()) return;
    const std::string text = std::move(known->second);
    texts_.erase(known);
    tell(FaultEvent::Kind::Ends, subject, text);
}

std::string FaultWatch::of(const std::string& subject) const {
    const auto known = texts_.find(subject);
    return known == texts_.end() ? std::string() : known->second;
}

void FaultWatch::tell(FaultEvent::Kind kind, const std::string& subject,
                      const std::string& text) const {
    if (report_) report_({kind, line_, subject, text});
}

}  // namespace poll
