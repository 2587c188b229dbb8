// What is said about a text that a user named or wrote.
#pragma once

#include <stdexcept>

namespace settings {

/// A text can't be taken: what() is one line that names it and says why.
class TextError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

/// A driver's description can't be read: what() is one line.
class DescriptionError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

}  // namespace settings
