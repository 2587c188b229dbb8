#include "tests/docs/Page.h"

#include <fstream>
#include <sstream>
#include <stdexcept>

namespace docs_test {

namespace {

std::string trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(' ');
    if (first == std::string_view::npos) return {};
    return std::string(text.substr(first, text.find_last_not_of(' ') + 1 - first));
}

/// "| a | b |" without the outer bars.
Row cellsOf(const std::string& line) {
    Row cells;
    std::size_t begin = 1;
    for (std::size_t end = line.find('|', begin); end != std::string::npos;
         end = line.find('|', begin)) {
        cells.push_back(trimmed(std::string_view(line).substr(begin, end - begin)));
        begin = end + 1;
    }
    return cells;
}

bool isTableLine(const std::string& line) {
    return line.starts_with('|');
}

}  // namespace

Page::Page(const std::string& path) : path_(path) {
    std::ifstream file(SOURCE_FOLDER "/" + path);
    if (!file) throw std::runtime_error("no such page: " + path);
    std::ostringstream text;
    text << file.rdbuf();
    text_ = text.str();
}

std::vector<Row> Page::table(const std::string& heading) const {
    std::istringstream lines(text_);
    std::string line;
    while (std::getline(lines, line) && line != heading) {
    }
    if (!lines) throw std::runtime_error(path_ + " has no heading " + heading);
    while (std::getline(lines, line) && !isTableLine(line)) {
        if (line.starts_with('#')) break;
    }
    std::vector<Row> rows;
    for (; lines && isTableLine(line); std::getline(lines, line))
        rows.push_back(cellsOf(line));
    // The head and the line below it.
    if (rows.size() < 3) throw std::runtime_error(path_ + " has no table below " + heading);
    rows.erase(rows.begin(), rows.begin() + 2);
    return rows;
}

std::vector<std::string> codeIn(std::string_view text) {
    std::vector<std::string> found;
    std::size_t open = text.find('`');
    while (open != std::string_view::npos) {
        const std::size_t close = text.find('`', open + 1);
        if (close == std::string_view::npos) break;
        found.emplace_back(text.substr(open + 1, close - open - 1));
        open = text.find('`', close + 1);
    }
    return found;
}

std::string onlyCodeIn(std::string_view cell) {
    const std::vector<std::string> found = codeIn(cell);
    if (found.size() != 1) throw std::runtime_error("not one code: " + std::string(cell));
    return found.front();
}

}  // namespace docs_test
