// Which faults last. Pure.
#pragma once

#include <map>
#include <string>

#include "poll/LineSetup.h"

namespace poll {

/// Tells a fault when it begins, changes and ends, and never in between.
class FaultWatch {
  public:
    FaultWatch(std::string line, FaultReport report);

    /// What is wrong with a subject now. A text that stays the same is not told again.
    void fault(const std::string& subject, const std::string& text);
    /// Nothing is wrong with it.
    void fine(const std::string& subject);
    /// @return the present text; "" when nothing is wrong.
    [[nodiscard]] std::string of(const std::string& subject) const;

  private:
    void tell(FaultEvent::Kind kind, const std::string& subject, const std::string& text) const;

    std::string line_;
    FaultReport report_;
    std::map<std::string, std::string> texts_;  // By subject.
};

}  // namespace poll
