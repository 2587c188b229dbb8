// Takes a terminal over and gives it back.
#include "cli/poll/TerminalScreen.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>

#include "cli/poll/ScreenWriter.h"

namespace cli {
namespace {

std::string variable(const char* name) {
    const char* const value = std::getenv(name);
    return value == nullptr ? "" : value;
}

bool namesUtf8(const std::string& locale) {
    return locale.find("UTF-8") != std::string::npos || locale.find("utf8") != std::string::npos ||
           locale.find("utf-8") != std::string::npos || locale.find("UTF8") != std::string::npos;
}

}  // namespace

TerminalAbilities terminalAbilities() {
    TerminalAbilities abilities{.colour = variable("NO_COLOR").empty(), .unicode = false};
    for (const char* const name : {"LC_ALL", "LC_CTYPE", "LANG"}) {
        const std::string locale = variable(name);
        if (locale.empty()) continue;
        abilities.unicode = namesUtf8(locale);
        break;
    }
    return abilities;
}

bool atTerminal() {
    return isatty(STDIN_FILENO) == 1 && isatty(STDOUT_FILENO) == 1 && variable("TERM") != "dumb";
}

TerminalScreen::TerminalScreen() : known_(tcgetattr(STDIN_FILENO, &found_) == 0) {
    take();
}

TerminalScreen::~TerminalScreen() {
    giveBack();
}

void TerminalScreen::take() {
    if (known_) {
        termios keys = found_;
        // Signals of the keyboard stay: Ctrl-C ends the command.
        keys.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO);
        keys.c_cc[VMIN] = 1;
        keys.c_cc[VTIME] = 0;
        tcsetattr(STDIN_FILENO, TCSANOW, &keys);
    }
    write(ScreenWriter::enter());
}

void TerminalScreen::giveBack() const noexcept {
    const char* const bytes = ScreenWriter::leave();
    [[maybe_unused]] const ssize_t written = ::write(STDOUT_FILENO, bytes, std::strlen(bytes));
    if (known_) tcsetattr(STDIN_FILENO, TCSANOW, &found_);
}

void TerminalScreen::putBack(const void* what) noexcept {
    static_cast<const TerminalScreen*>(what)->giveBack();
}

ScreenSize TerminalScreen::size() const {
    winsize size{};
    const bool told = ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0;
    if (!told || size.ws_col == 0 || size.ws_row == 0) return {};
    return {size.ws_col, size.ws_row};
}

bool TerminalScreen::write(std::string_view bytes) {
    while (!bytes.empty()) {
        const ssize_t count = ::write(STDOUT_FILENO, bytes.data(), bytes.size());
        if (count < 0 && errno == EINTR) continue;
        if (count <= 0) return false;
        bytes.remove_prefix(static_cast<std::size_t>(count));
    }
    return true;
}

void TerminalScreen::suspend() {
    giveBack();
    raise(SIGSTOP);
    take();
}

}  // namespace cli
