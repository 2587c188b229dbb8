// Texts of devices as printable text and back. Pure.
#pragma once

#include <string>
#include <string_view>

#include "values/LittleEndian.h"

namespace values {

/// @return the bytes as printable text without quotes: quotes, backslashes, line ends and tabs as
/// \" \\ \n \r \t, zero as \0, and every other byte that is neither printable ASCII nor part of a
/// printable UTF-8 character as \xHH.
std::string escapeText(ByteView bytes);

/// @return the text as a terminal may show it: what it would act on, and what is not UTF-8, as
/// \xHH; everything else, quotes and backslashes too, as it stands.
std::string printableText(std::string_view text);

/// Undoes escapeText(). A text in double quotes loses them; characters that need no escape may
/// stand for themselves.
/// Errors: ValueError on an unknown or cut escape or a quote without its partner.
Bytes unescapeText(std::string_view text);

/// @return the length of the UTF-8 character that `bytes` begins with; 0 when there is none.
/// Overlong forms, surrogates and numbers above U+10FFFF are none.
std::size_t utf8Length(ByteView bytes);
std::size_t utf8Length(std::string_view text);

}  // namespace values
