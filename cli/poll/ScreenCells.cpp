// Takes UTF-8 apart into columns.
#include "cli/poll/ScreenCells.h"

#include <algorithm>
#include <array>
#include <span>

#include "values/TextEscapes.h"

namespace cli {
namespace {

struct CharacterRange {
    char32_t first;
    char32_t last;
};

// Blocks of marks that combine with the character in front of them.
// Source: Unicode Standard, Blocks.txt.
constexpr std::array kCombining{
    CharacterRange{0x0300, 0x036F}, CharacterRange{0x1AB0, 0x1AFF}, CharacterRange{0x1DC0, 0x1DFF},
    CharacterRange{0x20D0, 0x20FF}, CharacterRange{0xFE00, 0xFE0F}, CharacterRange{0xFE20, 0xFE2F},
};

// Two columns wide. Source: Unicode Standard Annex 11, East Asian Width, values W and F.
constexpr std::array kWide{
    CharacterRange{0x1100, 0x115F},   CharacterRange{0x2E80, 0x303E},
    CharacterRange{0x3041, 0x33FF},   CharacterRange{0x3400, 0x4DBF},
    CharacterRange{0x4E00, 0x9FFF},   CharacterRange{0xA000, 0xA4CF},
    CharacterRange{0xAC00, 0xD7A3},   CharacterRange{0xF900, 0xFAFF},
    CharacterRange{0xFE30, 0xFE4F},   CharacterRange{0xFF00, 0xFF60},
    CharacterRange{0xFFE0, 0xFFE6},   CharacterRange{0x1F300, 0x1F64F},
    CharacterRange{0x1F900, 0x1F9FF}, CharacterRange{0x20000, 0x3FFFD},
};

// Controls, and the marks that change the direction of what follows or are not seen at all.
constexpr std::array kHarmful{
    CharacterRange{0x0000, 0x001F}, CharacterRange{0x007F, 0x009F}, CharacterRange{0x00AD, 0x00AD},
    CharacterRange{0x061C, 0x061C}, CharacterRange{0x200B, 0x200F}, CharacterRange{0x2028, 0x202E},
    CharacterRange{0x2060, 0x206F}, CharacterRange{0xFEFF, 0xFEFF}, CharacterRange{0xFFF9, 0xFFFB},
};

bool isIn(std::span<const CharacterRange> ranges, char32_t character) {
    return std::any_of(ranges.begin(), ranges.end(), [character](const CharacterRange& range) {
        return range.first <= character && character <= range.last;
    });
}

/// One character of a text and the bytes that it takes.
struct Character {
    char32_t code = 0;
    std::size_t bytes = 1;
    bool valid = false;
};

Character firstCharacter(std::string_view text) {
    const std::size_t bytes = values::utf8Length(text);
    if (bytes == 0) return {};
    const auto byteAt = [text](std::size_t at) { return static_cast<unsigned char>(text[at]); };
    // The lead byte of a character of n > 1 bytes begins with n ones and a zero.
    char32_t code = bytes == 1 ? byteAt(0) : byteAt(0) & (0x7FU >> bytes);
    for (std::size_t i = 1; i < bytes; ++i)
        code = code << 6 | (byteAt(i) & 0x3FU);
    return {code, bytes, true};
}

/// Calls `take(glyph, width)` for each character that is shown; width 0: it combines.
template <class Take>
void eachGlyph(std::string_view text, bool unicode, Take&& take) {
    while (!text.empty()) {
        const Character character = firstCharacter(text);
        const bool shown = character.valid && !isIn(kHarmful, character.code) &&
                           (unicode || character.code < 0x80);
        if (!shown) {
            take(std::string_view("?"), 1);
        } else if (isIn(kCombining, character.code)) {
            take(text.substr(0, character.bytes), 0);
        } else {
            take(text.substr(0, character.bytes), isIn(kWide, character.code) ? 2 : 1);
        }
        text.remove_prefix(character.bytes);
    }
}

/// More marks than that on one character are no language, and would make a cell as long as a line.
constexpr std::size_t kLongestGlyph = 32;

ScreenLine cellsOf(std::string_view text, bool unicode, CellStyle style) {
    ScreenLine cells;
    eachGlyph(text, unicode, [&cells, style](std::string_view glyph, int width) {
        if (width == 0) {
            if (cells.empty()) return;
            std::string& base = cells[cells.size() - (cells.back().glyph.empty() ? 2 : 1)].glyph;
            if (base.size() + glyph.size() <= kLongestGlyph) base += glyph;
            return;
        }
        cells.push_back({std::string(glyph), style});
        if (width == 2) cells.push_back({"", style});
    });
    return cells;
}

/// Half a wide character is shown as a blank.
void cut(ScreenLine& cells, std::size_t columns) {
    if (cells.size() <= columns) return;
    const bool halved = cells[columns].glyph.empty();
    cells.resize(columns);
    if (halved && !cells.empty()) cells.back().glyph = " ";
}

}  // namespace

LineBuilder::LineBuilder(int columns, bool unicode)
    : columns_(std::max(0, columns)), unicode_(unicode) {}

LineBuilder& LineBuilder::put(std::string_view text, CellStyle style) {
    ScreenLine cells = cellsOf(text, unicode_, style);
    cut(cells, static_cast<std::size_t>(room()));
    line_.insert(line_.end(), cells.begin(), cells.end());
    return *this;
}

LineBuilder& LineBuilder::putFitted(std::string_view text, int width, CellStyle style,
                                    Align align) {
    const auto columns = static_cast<std::size_t>(std::clamp(width, 0, room()));
    ScreenLine cells = cellsOf(text, unicode_, style);
    if (cells.size() > columns) {
        cut(cells, columns);
        if (columns > 1) {
            cut(cells, columns - 1);
            cells.push_back({unicode_ ? "…" : "~", style});
        }
    }
    const ScreenLine blanks(columns - cells.size(), Cell{" ", style});
    if (align == Align::Right) line_.insert(line_.end(), blanks.begin(), blanks.end());
    line_.insert(line_.end(), cells.begin(), cells.end());
    if (align == Align::Left) line_.insert(line_.end(), blanks.begin(), blanks.end());
    return *this;
}

int LineBuilder::room() const {
    return columns_ - static_cast<int>(line_.size());
}

ScreenLine LineBuilder::take() {
    ScreenLine line;
    line.swap(line_);
    return line;
}

int columnsOf(std::string_view text, bool unicode) {
    int columns = 0;
    eachGlyph(text, unicode, [&columns](std::string_view, int width) { columns += width; });
    return columns;
}

std::string textOf(const ScreenLine& line) {
    std::string text;
    for (const Cell& cell : line)
        text += cell.glyph;
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

}  // namespace cli
