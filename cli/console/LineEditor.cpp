// Lines from a terminal through libedit, or from a pipe as they come.
#include "cli/console/LineEditor.h"

#include <histedit.h>
#include <termios.h>
#include <unistd.h>

#include <cstdio>
#include <iostream>

#include "cli/EndSignals.h"
#include "runtime/LastAct.h"

namespace cli {
namespace {

constexpr int kHistoryLines = 200;

class PipedLines final : public LineSource {
  public:
    std::optional<std::string> next() override {
        std::string line;
        if (!std::getline(std::cin, line)) return std::nullopt;
        if (line.ends_with('\r')) line.pop_back();
        return line;
    }
    [[nodiscard]] bool interactive() const override { return false; }
};

/// The terminal as a person had it before the editing of lines made it raw.
class TypedTerminal {
  public:
    TypedTerminal() : known_(tcgetattr(STDIN_FILENO, &settings_) == 0) {}

  private:
    static void putBack(const void* what) noexcept {
        const auto& self = *static_cast<const TypedTerminal*>(what);
        if (self.known_) tcsetattr(STDIN_FILENO, TCSANOW, &self.settings_);
    }

    termios settings_{};
    bool known_;
    runtime::LastAct putBackAtTheEnd_{putBack, this};
};

class EditedLines final : public LineSource {
  public:
    explicit EditedLines(const char* prompt)
        : editor_(el_init("mrtu", stdin, stdout, stderr)), history_(history_init()) {
        HistEvent event{};
        history(history_, &event, H_SETSIZE, kHistoryLines);
        history(history_, &event, H_SETUNIQUE, 1);
        el_set(editor_, EL_CLIENTDATA, const_cast<char*>(prompt));
        el_set(editor_, EL_PROMPT, promptOf);
        el_set(editor_, EL_EDITOR, "emacs");
        el_set(editor_, EL_HIST, history, history_);
        el_set(editor_, EL_SIGNAL, 1);  // Ctrl-Z must not leave the terminal raw.
    }
    ~EditedLines() override {
        el_end(editor_);
        history_end(history_);
    }
    EditedLines(const EditedLines&) = delete;
    EditedLines& operator=(const EditedLines&) = delete;

    std::optional<std::string> next() override {
        int length = 0;
        const char* const typed = el_gets(editor_, &length);
        if (typed == nullptr || length <= 0) return std::nullopt;
        std::string line(typed, static_cast<std::size_t>(length));
        while (line.ends_with('\n') || line.ends_with('\r'))
            line.pop_back();
        if (!line.empty()) {
            HistEvent event{};
            history(history_, &event, H_ENTER, line.c_str());
        }
        return line;
    }
    [[nodiscard]] bool interactive() const override { return true; }

  private:
    static char* promptOf(EditLine* editor) {
        // The editor catches these too, but passes them on to the whole process group, and so to a
        // script that runs this command. It asks for the prompt when its handlers stand.
        retakeEndSignals();
        void* prompt = nullptr;
        el_get(editor, EL_CLIENTDATA, &prompt);
        return static_cast<char*>(prompt);
    }

    const TypedTerminal terminal_;  // Before the editor changes it.
    EditLine* editor_;
    History* history_;
};

}  // namespace

std::unique_ptr<LineSource> openStandardInput(const char* prompt) {
    if (isatty(STDIN_FILENO) == 1) return std::make_unique<EditedLines>(prompt);
    return std::make_unique<PipedLines>();
}

}  // namespace cli
