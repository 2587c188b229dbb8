// What is said to whoever wrote something that is no value.
#pragma once

#include <stdexcept>

namespace values {

/// A text is no value of its type, or no name of its kind: what() is one line that names the text
/// and what would be accepted.
class ValueError : public std::invalid_argument {
  public:
    using std::invalid_argument::invalid_argument;
};

}  // namespace values
