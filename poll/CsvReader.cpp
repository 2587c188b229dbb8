#include "poll/CsvReader.h"

#include <algorithm>
#include <utility>

namespace poll {
namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

bool isBlank(char character) {
    return character == ' ' || character == '\t';
}

}  // namespace

std::string_view withoutByteOrderMark(std::string_view text) {
    if (text.starts_with(kByteOrderMark)) text.remove_prefix(kByteOrderMark.size());
    return text;
}

void Complaints::add(const char* rule, int line, int column, std::string text) {
    out_.push_back({file_, line, column, std::move(text), rule});
}

void Complaints::add(const char* rule, const CsvCell& cell, std::string text) {
    add(rule, cell.line, cell.column, std::move(text));
}

CsvReader::CsvReader(std::string_view text, Complaints& complaints)
    : text_(withoutByteOrderMark(text)), complaints_(complaints) {}

bool CsvReader::next(std::vector<CsvCell>& cells) {
    cells.clear();
    broken_ = false;
    skipIdleLines();
    if (atEnd()) return false;
    cells.push_back(cell());
    while (!atLineEnd()) {
        ++at_;  // The comma.
        cells.push_back(cell());
    }
    endLine();
    return true;
}

bool CsvReader::atLineEnd() const {
    const std::string_view rest = text_.substr(std::min(at_, text_.size()));
    return rest.empty() || rest.front() == '\n' || rest == "\r" || rest.starts_with("\r\n");
}

void CsvReader::skipBlanks() {
    while (!atEnd() && isBlank(text_[at_]))
        ++at_;
}

void CsvReader::skipLine() {
    at_ = std::min(text_.find('\n', at_), text_.size());
}

void CsvReader::endLine() {
    skipLine();
    at_ = std::min(at_ + 1, text_.size());
    ++line_;
    lineStart_ = at_;
}

void CsvReader::skipIdleLines() {
    while (!atEnd()) {
        skipBlanks();
        if (!atLineEnd() && text_[at_] != '#') break;
        endLine();
    }
    at_ = lineStart_;
}

CsvCell CsvReader::cell() {
    skipBlanks();
    CsvCell cell{{}, line_, column()};
    if (!atEnd() && text_[at_] == '"') {
        takeQuoted(cell);
    } else {
        takeBare(cell);
    }
    return cell;
}

void CsvReader::takeBare(CsvCell& cell) {
    const std::size_t begin = at_;
    while (!atLineEnd() && text_[at_] != ',')
        ++at_;
    std::string_view bare = text_.substr(begin, at_ - begin);
    while (!bare.empty() && isBlank(bare.back()))
        bare.remove_suffix(1);
    cell.text = bare;
    const std::size_t quote = bare.find('"');
    if (quote == std::string_view::npos) return;
    complaints_.add("stray-quote", cell.line, cell.column + static_cast<int>(quote),
                    "a quote within a field: expected the whole field in double quotes, and the "
                    "quotes in it doubled");
}

void CsvReader::takeQuoted(CsvCell& cell) {
    ++at_;
    if (!takeToQuote(cell)) {
        broken_ = true;
        return complaints_.add("unclosed-quote", cell,
                               "this quote is not closed: expected another before the end of the "
                               "file");
    }
    skipBlanks();
    if (atLineEnd() || text_[at_] == ',') return;
    complaints_.add("text-behind-quote", line_, column(),
                    "text behind the closing quote: expected a comma or the end of the line; a "
                    "quote within a field is written twice");
    broken_ = true;
    skipLine();
}

/// Also takes the quote. @return false at the end of the text.
bool CsvReader::takeToQuote(CsvCell& cell) {
    for (; !atEnd(); ++at_) {
        const bool quote = text_[at_] == '"';
        if (quote && text_.substr(at_ + 1, 1) != "\"") {
            ++at_;
            return true;
        }
        if (quote) ++at_;
        cell.text += text_[at_];
        if (text_[at_] != '\n') continue;
        ++line_;
        lineStart_ = at_ + 1;
    }
    return false;
}

}  // namespace poll
