// What a command line may hold, as data: the parser, the man pages and the completions are made of
// it, so that none of them can tell something else.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <variant>
#include <vector>

namespace cli {

/// Judges the word behind an option, and may put another in its place.
/// @return what is wrong with it; empty: it is taken.
using WordCheck = std::function<std::string(std::string& word)>;

/// Where an option's words go: a flag's into bool, those of an option that can be repeated into a
/// vector. Not owned: the variable must live until the line was parsed. None: the parser's own.
using Target = std::variant<std::monostate, bool*, int*, std::string*, std::vector<int>*,
                            std::vector<std::string>*>;

/// The numbers that an option takes, both ends included.
struct NumberRange {
    int smallest;
    int largest;
};

struct OptionSpec {
    std::string names;  ///< "-q,--quiet"; one name without dashes for a positional argument.
    Target target;
    std::string help;
    std::string valueName{};  ///< What --help shows for the value; empty: TEXT or INT.
    std::string group = "Options";
    /// The only words, in capitals or not; the target gets them as they stand here.
    std::vector<std::string> choices{};
    WordCheck check{};
    std::optional<NumberRange> range{};
    std::vector<std::string> excludes{};  ///< Names of options that were added before.
    bool required = false;
    bool showsDefault = false;  ///< --help shows what the target holds at first.
    /// Of an option with a vector: every word needs the name in front, or it is an argument.
    bool oneWordEach = false;

    /// The names one by one, with their dashes.
    [[nodiscard]] std::vector<std::string> nameList() const;
    [[nodiscard]] bool isPositional() const;
    [[nodiscard]] bool takesValue() const;
    [[nodiscard]] bool isRepeated() const;
    /// @return what --help shows for the value; empty for a flag.
    [[nodiscard]] std::string shownValueName() const;
};

struct CommandSpec {
    std::string name;
    std::string summary;
    std::string footer{};   ///< The text under the options; empty: that of the command above.
    std::string version{};  ///< What --version prints; empty: no such option.
    std::vector<OptionSpec> options{};
    std::vector<CommandSpec> commands{};  ///< At most one of them can be named.
    bool needsCommand = false;            ///< One of them must be named.
    std::function<void()> action{};       ///< What the command does once its line was accepted.

    /// Adds options that stand together in --help, below the group's name.
    void addGroup(const char* group, std::vector<OptionSpec> more);

    /// @return all that the command accepts: --help, --version, `options`, in this order.
    [[nodiscard]] std::vector<OptionSpec> allOptions() const;
};

}  // namespace cli
