// A place in a text that a person wrote.
#pragma once

#include <string>

namespace settings {

/// Where something stands. Lines and columns count from 1, columns in bytes.
struct Place {
    std::string source;  ///< A file's name, or "argument" for tags of the command line.
    int line;
    int column;

    bool operator==(const Place&) const = default;
};

}  // namespace settings
