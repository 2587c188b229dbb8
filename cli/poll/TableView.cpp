// Scrolls and filters.
#include "cli/poll/TableView.h"

#include <algorithm>

namespace cli {
namespace {

std::string inSmallLetters(std::string text) {
    for (char& letter : text) {
        if (letter >= 'A' && letter <= 'Z') letter = static_cast<char>(letter - 'A' + 'a');
    }
    return text;
}

bool isContinuation(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0) == 0x80;
}

void removeLastCharacter(std::string& text) {
    while (!text.empty() && isContinuation(text.back()))
        text.pop_back();
    if (!text.empty()) text.pop_back();
}

}  // namespace

void TableView::setRows(const std::vector<std::string>& texts) {
    texts_.clear();
    texts_.reserve(texts.size());
    for (const std::string& text : texts)
        texts_.push_back(inSmallLetters(text));
    match();
}

void TableView::match() {
    const std::string wanted = inSmallLetters(filter_);
    matching_.clear();
    for (std::size_t row = 0; row < texts_.size(); ++row) {
        if (texts_[row].find(wanted) != std::string::npos) matching_.push_back(row);
    }
    fit(rows_);
}

void TableView::fit(std::size_t rows) {
    rows_ = std::max<std::size_t>(1, rows);
    const std::size_t last = matching_.size() > rows_ ? matching_.size() - rows_ : 0;
    top_ = std::min(top_, last);
}

void TableView::up(std::size_t rows) {
    top_ -= std::min(top_, rows);
}

void TableView::down(std::size_t rows) {
    top_ += std::min(rows, matching_.size());
    fit(rows_);
}

void TableView::press(const Key& key) {
    switch (key.kind) {
        case KeyKind::Up:
            return up(1);
        case KeyKind::Down:
            return down(1);
        case KeyKind::PageUp:
            return up(rows_);
        case KeyKind::PageDown:
            return down(rows_);
        case KeyKind::Home:
            return up(matching_.size());
        case KeyKind::End:
            return down(matching_.size());
        default:
            break;
    }
    if (typing_ || key.kind == KeyKind::Escape) return type(key);
    if (key.kind == KeyKind::Character) command(key.text);
}

void TableView::type(const Key& key) {
    if (key.kind == KeyKind::Enter) {
        typing_ = false;
        return;
    }
    if (key.kind == KeyKind::Escape) {
        typing_ = false;
        filter_.clear();
    }
    if (key.kind == KeyKind::Backspace) removeLastCharacter(filter_);
    if (key.kind == KeyKind::Character) filter_ += key.text;
    match();
}

void TableView::command(const std::string& text) {
    if (text == "q" || text == "Q") ended_ = true;
    if (text == "/") typing_ = true;
    if (text == "k") up(1);
    if (text == "j") down(1);
    if (text == " ") down(rows_);
    if (text == "g") up(matching_.size());
    if (text == "G") down(matching_.size());
}

}  // namespace cli
