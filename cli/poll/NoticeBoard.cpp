// Cuts what is told into lines.
#include "cli/poll/NoticeBoard.h"

namespace cli {
namespace {

constexpr std::string_view kPrefix = "mrtu: ";

}  // namespace

void NoticeBoard::hold(bool held) {
    const std::lock_guard lock(mutex_);
    held_ = held;
}

void NoticeBoard::tell(const std::string& text) {
    line(std::string(kPrefix) + text);
}

void NoticeBoard::line(const std::string& line) {
    const std::lock_guard lock(mutex_);
    last_ = line.starts_with(kPrefix) ? line.substr(kPrefix.size()) : line;
    if (!held_) err_ << line << '\n' << std::flush;
}

std::string NoticeBoard::last() const {
    const std::lock_guard lock(mutex_);
    return last_;
}

NoticeStream::Lines::int_type NoticeStream::Lines::overflow(int_type letter) {
    if (letter == traits_type::eof()) return 0;
    if (letter == '\n') {
        board_.line(line_);
        line_.clear();
    } else {
        line_ += traits_type::to_char_type(letter);
    }
    return letter;
}

}  // namespace cli
