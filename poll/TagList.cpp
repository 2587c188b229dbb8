#include "poll/TagList.h"

#include <fmt/format.h>

#include <algorithm>

#include <algorithm>
#include <tuple>
#include <unordered_map>

#include "poll/CsvReader.h"
#include "poll/ListHeader.h"
#include "values/Numbers.h"
#include "values/TextEscapes.h"

namespace poll {
namespace {

using Cells = std::vector<CsvCell>;

/// Lines one by one, without their ends.
class Lines {
  public:
    explicit Lines(std::string_view text) : rest_(withoutByteOrderMark(text)) {}

    bool next(std::string_view& line) {
        if (rest_.empty()) return false;
        const std::size_t end = std::min(rest_.find('\n'), rest_.size());
        line = rest_.substr(0, end);
        rest_.remove_prefix(std::min(end + 1, rest_.size()));
        if (line.ends_with('\r')) line.remove_suffix(1);
        ++number_;
        return true;
    }
    [[nodiscard]] int number() const { return number_; }

  private:
    std::string_view rest_;
    int number_ = 0;
};

/// @return the first line that says something; empty when none does.
std::string_view firstLine(std::string_view text) {
    Lines lines(text);
    for (std::string_view line; lines.next(line);) {
        line = values::trimmed(line);
        if (!line.empty() && line.front() != '#') return line;
    }
    return {};
}

void readPlain(std::string_view text, TagList& list) {
    Lines lines(text);
    for (std::string_view line; lines.next(line);) {
        const std::string_view uri = values::trimmed(line.substr(0, line.find('#')));
        if (uri.empty()) continue;
        const int column = static_cast<int>(uri.data() - line.data()) + 1;
        list.tags.push_back({.name = std::string(uri),
                             .uri = std::string(uri),
                             .line = lines.number(),
                             .columns = {.name = column, .uri = column}});
    }
}

/// @return the place of the first byte that belongs to no UTF-8 character.
std::size_t firstForeignByte(std::string_view text) {
    for (std::size_t at = 0; at < text.size();) {
        if (static_cast<unsigned char>(text[at]) < 0x80) {
            ++at;
            continue;
        }
        const std::size_t length = values::utf8Length(text.substr(at));
        if (length == 0) return at;
        at += length;
    }
    return std::string_view::npos;
}

void complainOfForeignBytes(std::string_view text, Complaints& complaints) {
    Lines lines(text);
    for (std::string_view line; lines.next(line);) {
        const std::size_t at = firstForeignByte(line);
        if (at == std::string_view::npos) continue;
        complaints.add("not-utf-8", lines.number(), static_cast<int>(at) + 1,
                       fmt::format("byte 0x{:02X} is no UTF-8: expected a file saved as UTF-8",
                                   static_cast<unsigned char>(line[at])));
    }
}

bool fieldsFit(const Cells& cells, const ListHeader& header, Complaints& complaints) {
    const std::size_t wanted = header.columns.size();
    if (cells.size() == wanted) return true;
    const CsvCell& at = cells.size() > wanted ? cells[wanted] : cells.back();
    complaints.add(
        "field-count", at,
        fmt::format("{} field{}: expected {} as in the header line{}", cells.size(),
                    cells.size() == 1 ? "" : "s", wanted,
                    cells.size() > wanted ? "; a field that holds a comma needs double quotes, "
                                            "a number a decimal point"
                                          : ""));
    return false;
}

ListedTag takeCells(const Cells& cells, const ListHeader& header, Complaints& complaints) {
    ListedTag tag{.name = {}, .uri = {}, .line = cells[0].line};
    for (std::size_t i = 0; i < cells.size(); ++i) {
        const ListColumn* const column = header.columns[i];
        if (column == nullptr) continue;
        if (column->place != nullptr) tag.columns.*column->place = cells[i].column;
        if (!cells[i].text.empty()) {
            column->take(tag, cells[i], complaints);
        } else if (column->emptyRule != nullptr) {
            complaints.add(column->emptyRule, cells[i],
                           fmt::format("no {}: expected one for every tag", column->name));
        }
    }
    return tag;
}

/// Which names there are, and in which line.
using Names = std::unordered_map<std::string, int>;

void noteName(Names& names, const ListedTag& tag, Complaints& complaints) {
    const auto [known, isNew] = names.try_emplace(tag.name, tag.line);
    if (isNew) return;
    complaints.add("duplicate-name", tag.line, tag.columns.name,
                   fmt::format("a second tag '{}', see line {}: expected a name of its own",
                               tag.name, known->second));
}

void readRows(CsvReader& reader, const ListHeader& header, TagList& list, Complaints& complaints) {
    Names names;
    for (Cells cells; reader.next(cells);) {
        if (reader.broken() || !fieldsFit(cells, header, complaints)) continue;
        ListedTag tag = takeCells(cells, header, complaints);
        if (!tag.name.empty()) noteName(names, tag, complaints);
        if (!tag.name.empty() && !tag.uri.empty()) list.tags.push_back(std::move(tag));
    }
}

void readCsv(std::string_view text, TagList& list, Complaints& complaints) {
    complainOfForeignBytes(text, complaints);
    CsvReader reader(text, complaints);
    Cells cells;
    ListHeader header;
    reader.next(cells);
    if (reader.broken() || !readHeader(cells, header, complaints)) return;
    readRows(reader, header, list, complaints);
}

}  // namespace

TagList parseTagList(std::string_view text, const std::string& fileName) {
    TagList list;
    Complaints complaints(fileName, list.complaints);
    const std::string_view first = firstLine(text);
    if (first.find('?') != std::string_view::npos) {
        readPlain(text, list);
    } else if (!first.empty()) {
        readCsv(text, list, complaints);
    }
    if (list.tags.empty() && list.complaints.empty()) {
        complaints.add("empty-list", 1, 1,
                       "no tag: expected a header line with name and uri and a line for each tag, "
                       "or a URI a line");
    }
    std::stable_sort(list.complaints.begin(), list.complaints.end(),
                     [](const ListComplaint& a, const ListComplaint& b) {
                         return std::tie(a.line, a.column) < std::tie(b.line, b.column);
                     });
    return list;
}

}  // namespace poll
