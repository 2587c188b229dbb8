// Which part of a table is looked at, and what keys make of it. Pure.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "cli/poll/KeyDecoder.h"

namespace cli {

class TableView {
  public:
    /// Another list. The filter stays, and the place as far as there still is one.
    /// @param texts  What the filter looks for its words in, one text a row.
    void setRows(const std::vector<std::string>& texts);

    /// Arrows, PgUp, PgDn, Home, End (also k, j, space, g, G) move; "/" begins a filter, which
    /// Enter keeps and Escape takes away; "q" ends.
    void press(const Key& key);

    /// @param rows  How many rows are seen at once; the place is moved to where they are filled.
    void fit(std::size_t rows);

    /// @return the rows that pass the filter, in their order.
    [[nodiscard]] const std::vector<std::size_t>& matching() const { return matching_; }
    /// @return the first of matching() that is seen.
    [[nodiscard]] std::size_t top() const { return top_; }
    [[nodiscard]] const std::string& filter() const { return filter_; }
    [[nodiscard]] bool typing() const { return typing_; }
    [[nodiscard]] bool ended() const { return ended_; }

  private:
    void type(const Key& key);
    void command(const std::string& text);
    void up(std::size_t rows);
    void down(std::size_t rows);
    void match();

    std::vector<std::string> texts_;  ///< In small letters.
    std::vector<std::size_t> matching_;
    std::string filter_;
    std::size_t top_ = 0;
    std::size_t rows_ = 1;
    bool typing_ = false;
    bool ended_ = false;
};

}  // namespace cli
