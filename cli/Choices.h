// Answers to words that are none of those accepted: what would be, and what was probably meant.
// Pure.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace cli {

/// Tells whether two words are the same but for upper and lower case.
bool sameWord(std::string_view a, std::string_view b);

/// @return "; did you mean 'even'?", or nothing where no name is near.
std::string didYouMean(std::string_view word, const std::vector<std::string>& names);

/// @return "'evn' is not one of none, even, odd, mark; did you mean 'even'?"
std::string notOneOf(std::string_view word, const std::vector<std::string>& choices);

/// @return the number of decimal digits alone; -1 for any other text and for a number above
/// `largest`.
long plainNumber(std::string_view text, long largest);

}  // namespace cli
