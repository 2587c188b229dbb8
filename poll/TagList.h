// Lists of tags as people write them: names, URIs and what belongs to each. Pure.
//
// Two forms, told apart by the first line that is neither empty nor a comment:
//   CSV    a header line that names the columns, in any order: name and uri, and of period, scale,
//          offset, unit, decimals, low, high and comment those that are wanted; then a tag a line.
//          Fields are separated by commas; double quotes around a field let it hold commas, line
//          ends and doubled quotes. UTF-8, with or without a byte order mark.
//   plain  a URI a line, what every line is when the first holds a "?".
// Lines end in LF or CRLF. "#" at the beginning of a line of either form makes it a comment; in the
// plain form also behind a URI.
#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace poll {

/// The columns, in bytes from 1, in which the cells of a tag begin; 1 for a cell that is not there.
struct CellColumns {
    int name = 1;
    int uri = 1;
    int period = 1;
    int scale = 1;
    int offset = 1;
    int decimals = 1;
    int low = 1;
};

/// What is not given, or was complained of, is absent or empty.
struct ListedTag {
    std::string name, uri;                                   ///< In a plain list name == uri.
    std::optional<std::chrono::milliseconds> period{};       ///< 1 ms to a day.
    std::optional<double> scale{}, offset{}, low{}, high{};  ///< Finite; the scale is not 0.
    std::string unit{}, comment{};
    std::optional<int> decimals{};  ///< 0 to 15.
    int line = 0;                   ///< In the file, from 1.
    CellColumns columns{};
};

/// What is wrong at one place of a list.
struct ListComplaint {
    std::string file;
    int line, column;    ///< From 1, the column in bytes.
    std::string text;    ///< What is wrong and what was expected; one line.
    const char* rule{};  ///< A name that does not change, e.g. "duplicate-name".
};

struct TagList {
    std::vector<ListedTag> tags;            ///< In the order of the file.
    std::vector<ListComplaint> complaints;  ///< In the order of the file; empty: the list is good.
};

/// Reads a whole list. After a complaint it goes on, so that one run tells everything: `tags` holds
/// each line that has a name and a URI, but a list with complaints is not to be used.
/// @param fileName  What complaints call the file.
TagList parseTagList(std::string_view text, const std::string& fileName);

}  // namespace poll
