#include "poll/ListHeader.h"

#include <fmt/format.h>

#include <algorithm>

#include "values/NearestName.h"

namespace poll {
namespace {

using Cells = std::vector<CsvCell>;

std::string lowerCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(), [](char each) {
        return each >= 'A' && each <= 'Z' ? static_cast<char>(each - 'A' + 'a') : each;
    });
    return text;
}

std::string unknownColumn(const std::string& name) {
    std::vector<std::string> names;
    names.reserve(kListColumns.size());
    for (const ListColumn& column : kListColumns)
        names.emplace_back(column.name);
    const std::string nearest = values::nearestName(name, names);
    if (!nearest.empty()) {
        return fmt::format("unknown column '{}': expected '{}', perhaps", name, nearest);
    }
    return fmt::format("unknown column '{}': expected one of {}", name, listColumnNames());
}

void takeColumn(ListHeader& header, const CsvCell& cell, Complaints& complaints) {
    const auto* const column =
        std::find_if(kListColumns.begin(), kListColumns.end(),
                     [&](const ListColumn& each) { return each.name == lowerCase(cell.text); });
    if (column == kListColumns.end()) {
        complaints.add("unknown-column", cell, unknownColumn(cell.text));
        header.columns.push_back(nullptr);
        return;
    }
    if (header.has(*column)) {
        complaints.add("duplicate-column", cell,
                       fmt::format("a second column '{}': expected each once", column->name));
    }
    header.columns.push_back(column);
}

/// Tells whether the header's only cell can be explained better than cell by cell.
bool isNoHeader(const Cells& cells, Complaints& complaints) {
    if (cells.size() != 1) return false;
    const std::string& text = cells[0].text;
    const bool separated = text.find_first_of(";\t") != std::string::npos;
    const std::string expected =
        "expected a header line like 'name,uri,unit', or a list of URIs, one a line";
    if (separated) {
        complaints.add("no-header", cells[0],
                       "columns that are not separated by commas: " + expected);
    } else {
        complaints.add("no-header", cells[0],
                       fmt::format("'{}' is neither a header line nor a URI: {}", text, expected));
    }
    return true;
}

}  // namespace

bool ListHeader::has(const ListColumn& column) const {
    return std::find(columns.begin(), columns.end(), &column) != columns.end();
}

bool readHeader(const Cells& cells, ListHeader& header, Complaints& complaints) {
    if (isNoHeader(cells, complaints)) return false;
    for (const CsvCell& cell : cells)
        takeColumn(header, cell, complaints);
    bool complete = true;
    for (std::size_t i = 0; i < kNeededColumns; ++i) {
        if (header.has(kListColumns[i])) continue;
        complete = false;
        complaints.add("missing-column", cells[0],
                       fmt::format("no column '{}': expected 'name' and 'uri' in the header line",
                                   kListColumns[i].name));
    }
    return complete;
}

}  // namespace poll
