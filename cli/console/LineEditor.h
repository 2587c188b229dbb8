// Lines typed by a person (editing, history) or piped in by a program.
#pragma once

#include <memory>
#include <optional>
#include <string>

namespace cli {

class LineSource {
  public:
    virtual ~LineSource() = default;
    /// @return the next line without its end; nothing at the end of the input.
    virtual std::optional<std::string> next() = 0;
    /// Tells whether a person sits at the other end.
    [[nodiscard]] virtual bool interactive() const = 0;
};

/// @return lines of standard input: with a prompt, editing and history when it is a terminal.
/// @param prompt  Lives as long as the source.
std::unique_ptr<LineSource> openStandardInput(const char* prompt);

}  // namespace cli
