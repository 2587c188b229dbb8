// Lines through a stream, the table through the terminal.
#include "cli/poll/PollOutputs.h"

#include <cerrno>
#include <ostream>

namespace cli {

RecordOutput::RecordOutput(std::ostream& out, NoticeBoard& board, RecordForm form, RecordWhen when)
    : out_(out), board_(board), records_(form, when) {}

bool RecordOutput::show(const ShownTags& tags, const poll::Snapshot& snapshot,
                        std::chrono::system_clock::time_point now) {
    std::string lines = begun_ ? "" : records_.header();
    begun_ = true;
    lines += records_.news(tags, snapshot, now);
    if (lines.empty()) return true;
    errno = 0;
    out_ << lines << std::flush;
    if (out_) return true;
    readerGone_ = errno == EPIPE;
    return false;
}

TableOutput::TableOutput(NoticeBoard& board, TerminalAbilities abilities)
    : board_(board),
      style_{.unicode = abilities.unicode, .widths = {}},
      writer_(abilities.colour) {}

bool TableOutput::show(const ShownTags& tags, const poll::Snapshot& snapshot,
                       std::chrono::system_clock::time_point now) {
    history_.note(tags, snapshot);
    const ShownRows rows(tags, snapshot, history_, now);
    const ScreenSize size = terminal_.size();
    const auto lines = liveTable(contentOf(snapshot, board_.last()), rows, view_, size, style_);
    return terminal_.write(writer_.draw(lines, size));
}

bool TableOutput::take(const Happened& happened) {
    if (happened.suspend) {
        terminal_.suspend();
        writer_.forget();
    }
    for (const Key& key : keys_.feed(happened.typed)) {
        if (key.kind == KeyKind::Redraw) writer_.forget();
        view_.press(key);
    }
    if (happened.typed.empty()) {
        if (const auto key = keys_.idle()) view_.press(*key);
    }
    return !view_.ended();
}

void TableOutput::changeTags(const ShownTags& tags) {
    history_.forget();
    style_.widths = tags.widths(style_.unicode);
    view_.setRows(tags.searchTexts());
}

}  // namespace cli
