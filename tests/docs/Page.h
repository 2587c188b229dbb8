// A page of the documents as its reader sees it: headings, tables and what is set as code.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace docs_test {

/// The cells of a table's line, blanks around them taken away.
using Row = std::vector<std::string>;

class Page {
  public:
    /// Throws std::runtime_error when the file can't be read.
    /// @param path  From the project's folder on, "docs/tag-uri.md".
    explicit Page(const std::string& path);

    const std::string& text() const { return text_; }

    /// @return the lines of the first table below the heading, its head left out. Throws
    /// std::runtime_error when the page has no such heading, or no table below it.
    std::vector<Row> table(const std::string& heading) const;

  private:
    std::string path_;
    std::string text_;
};

/// @return what stands between back quotes, in order, without what stands between them.
std::vector<std::string> codeIn(std::string_view text);

/// @return the only code of a cell. Throws std::runtime_error when there are more or none.
std::string onlyCodeIn(std::string_view cell);

}  // namespace docs_test
