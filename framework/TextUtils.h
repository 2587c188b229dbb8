// Small text utilities that every driver of the family shares. Pure, callable from any thread.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ProtUtilsN {

/// The six white-space characters and the ten digits of the "C" locale, whatever the host's is.
bool isWhiteSpace(char c);
bool isDecimalDigit(char c);

/// Removes blanks and tabs (no other white space) from both ends.
void Trim(std::string& text);
std::string GetTrim(const std::string& text);

/// Takes the first piece, trimmed, and its delimiter off the front of `rest`. Needs no memory.
/// @param more  Receives whether there was a delimiter, and so another piece behind it.
std::string_view takePiece(std::string_view& rest, char delimiter, bool& more);

/// Splits at every delimiter and appends each piece, trimmed, to `pieces`, which is not cleared
/// first. Empty pieces are kept; an empty text is one empty piece.
void ParseSubstrings(const std::string& text, std::vector<std::string>& pieces, char delimiter);

/// Finds the first `key` + "=" anywhere in `text` and stores the letters and digits that follow.
/// @return false, with `value` untouched, when there is none.
bool GetConfigValue(const char* text, const char* key, std::string& value);

/// Reads an integer whose base follows from its prefix (0x hexadecimal, leading 0 octal, else
/// decimal), after optional blanks and sign. Reading stops at the first character that does not
/// fit; no digits read as 0; a number beyond 32 bits reads as the nearest 32-bit one, on every
/// architecture.
std::int32_t parseInteger(const char* text);
/// The same with base 10, whatever the prefix.
std::int32_t parseDecimal(const char* text);

/// Copies `text` into `out` the way strncpy() does: at most `size` bytes, the rest filled with
/// zeroes, unterminated when the text has `size` bytes or more. A `size` below 1 writes nothing.
void copyBounded(char* out, const char* text, int size);

/// Writes one text behind the other into the caller's buffer until that is full; the rest is
/// swallowed. Needs no memory.
class BoundedWriter {
  public:
    BoundedWriter(char* out, int size) : out_(out), size_(size) {}
    BoundedWriter& operator<<(std::string_view text);
    BoundedWriter& operator<<(int number);

    int written() const { return written_; }
    /// Fills what is left with zeroes.
    void pad();

  private:
    char* out_;
    int size_;
    int written_ = 0;
};

}  // namespace ProtUtilsN

/// Writes the digits of `value` and a terminating zero. Base 16 has the digits 0-9 and a-f; any
/// other base adds the remainder to "0", so bases up to 10 give digits. No sign is written:
/// REQUIRES: value >= 0, base >= 2, and room for the digits and the zero.
/// @return buffer
char* itoa(int value, char* buffer, int base);
