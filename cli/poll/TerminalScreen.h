// The terminal as a screen with keys.
#pragma once

#include <termios.h>

#include <string>
#include <string_view>

#include "cli/poll/ScreenCells.h"
#include "runtime/LastAct.h"

namespace cli {

/// What the environment says of the terminal.
struct TerminalAbilities {
    bool colour = true;   ///< NO_COLOR is not there or empty. Source: no-color.org.
    bool unicode = true;  ///< The first of LC_ALL, LC_CTYPE and LANG that is set names UTF-8.
};
TerminalAbilities terminalAbilities();

/// Tells whether standard input and output are a terminal that can be drawn on.
bool atTerminal();

/// Owns the terminal from construction to the end: the screen is cleared, keys come without Enter
/// and are not shown. Everything is put back, also by a signal that ends the process.
class TerminalScreen {
  public:
    TerminalScreen();
    ~TerminalScreen();
    TerminalScreen(const TerminalScreen&) = delete;
    TerminalScreen& operator=(const TerminalScreen&) = delete;

    /// @return 80 x 24 where the terminal does not tell.
    [[nodiscard]] ScreenSize size() const;
    /// Writes all of it. @return false when the terminal is gone.
    bool write(std::string_view bytes);

    /// Gives the terminal back and stops the process, as Ctrl-Z does; takes the terminal again when
    /// the process goes on. The screen is empty then.
    void suspend();

  private:
    void take();
    void giveBack() const noexcept;
    static void putBack(const void* what) noexcept;

    termios found_{};
    bool known_;
    runtime::LastAct putBackAtTheEnd_{putBack, this};
};

}  // namespace cli
