// Comma-separated values, strictly, with the place of every cell. Pure.
//
// A reader of our own: those that Debian carries hand out cells without saying where they stood,
// take a quote that is never closed for the rest of the file, or throw at the first mistake, while
// a person with a thousand lines to mend needs line and column of each.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "poll/TagList.h"

namespace poll {

struct CsvCell {
    std::string text;  ///< Without quotes; without the blanks around it unless in the quotes.
    int line;
    int column;
};

/// The complaints of one file.
class Complaints {
  public:
    /// @param out  Receives them; outlives this.
    Complaints(std::string file, std::vector<ListComplaint>& out)
        : file_(std::move(file)), out_(out) {}

    void add(const char* rule, int line, int column, std::string text);
    void add(const char* rule, const CsvCell& cell, std::string text);

  private:
    std::string file_;
    std::vector<ListComplaint>& out_;
};

/// Walks through a text record by record. Empty lines and lines that begin with "#" are left out.
class CsvReader {
  public:
    /// @param text        Outlives the reader. A byte order mark at its front does not count.
    /// @param complaints  Outlives the reader.
    CsvReader(std::string_view text, Complaints& complaints);

    /// @param cells  Receives the next record's, one at least.
    /// @return false at the end of the text; `cells` is empty then.
    bool next(std::vector<CsvCell>& cells);

    /// @return true when the record that next() gave has cells that could not be told apart, which
    /// was complained of.
    [[nodiscard]] bool broken() const { return broken_; }

  private:
    [[nodiscard]] bool atEnd() const { return at_ >= text_.size(); }
    [[nodiscard]] bool atLineEnd() const;
    [[nodiscard]] int column() const { return static_cast<int>(at_ - lineStart_) + 1; }
    void skipBlanks();
    void skipLine();
    void endLine();
    void skipIdleLines();
    CsvCell cell();
    void takeBare(CsvCell& cell);
    void takeQuoted(CsvCell& cell);
    bool takeToQuote(CsvCell& cell);

    std::string_view text_;
    Complaints& complaints_;
    std::size_t at_ = 0;
    std::size_t lineStart_ = 0;
    int line_ = 1;
    bool broken_ = false;
};

/// @return the text without a byte order mark at its front.
std::string_view withoutByteOrderMark(std::string_view text);

}  // namespace poll
