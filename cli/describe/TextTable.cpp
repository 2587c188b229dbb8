// Columns as wide as their widest entry.
#include "cli/describe/TextTable.h"

#include <algorithm>

namespace cli {
namespace {

constexpr std::size_t kGap = 2;

std::vector<std::size_t> columnWidths(const std::vector<std::vector<std::string>>& rows) {
    std::vector<std::size_t> widths;
    for (const auto& row : rows) {
        widths.resize(std::max(widths.size(), row.size()));
        for (std::size_t i = 0; i < row.size(); ++i) {
            widths[i] = std::max(widths[i], row[i].size());
        }
    }
    return widths;
}

/// @return the text in lines of at most `space` characters, as far as its words allow.
std::vector<std::string> wrapped(const std::string& text, std::size_t space) {
    std::vector<std::string> lines;
    std::string rest = text;
    while (rest.size() > space) {
        std::size_t blank = rest.rfind(' ', space);
        if (blank == std::string::npos || blank == 0) blank = rest.find(' ', space);
        if (blank == std::string::npos) break;
        lines.push_back(rest.substr(0, blank));
        rest = rest.substr(blank + 1);
    }
    lines.push_back(rest);
    return lines;
}

void appendRow(std::string& out, const std::vector<std::string>& row,
               const std::vector<std::size_t>& widths, std::size_t width) {
    if (row.empty()) return;
    std::string line;
    for (std::size_t i = 0; i + 1 < row.size(); ++i) {
        line += row[i] + std::string(widths[i] + kGap - row[i].size(), ' ');
    }
    const std::size_t indent = line.size();
    const std::size_t space = width > indent ? width - indent : 1;
    for (const std::string& piece : wrapped(row.back(), space)) {
        line += piece;
        out += line.substr(0, line.find_last_not_of(' ') + 1) + '\n';
        line.assign(indent, ' ');
    }
}

}  // namespace

std::string textTable(const std::vector<std::vector<std::string>>& rows, std::size_t width) {
    const std::vector<std::size_t> widths = columnWidths(rows);
    std::string out;
    for (const auto& row : rows)
        appendRow(out, row, widths, width);
    return out;
}

}  // namespace cli
