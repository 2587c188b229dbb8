// Puts the lines of the screen together.
#include "cli/poll/LiveTable.h"

#include <fmt/format.h>

#include <algorithm>

#include "cli/poll/StateText.h"
#include "cli/poll/TableColumns.h"

namespace cli {
namespace {

/// How the rows of the screen are shared out.
struct Shares {
    std::size_t tags = 1;
    std::size_t nodes = 0;
    bool titles = false;
    bool line = false;
    bool keys = false;
};

/// Tags come first, but a third of the screen may tell of the nodes.
Shares sharesOf(int rows, std::size_t nodes) {
    Shares shares;
    shares.titles = rows >= 4;
    shares.line = rows >= 5;
    shares.keys = rows >= 8;
    const std::size_t third = rows >= 8 ? static_cast<std::size_t>(rows) / 3 : 0;
    shares.nodes = std::min(nodes, third);
    const std::size_t others =
        1 + shares.nodes + (shares.titles ? 1 : 0) + (shares.line ? 1 : 0) + (shares.keys ? 1 : 0);
    const auto all = static_cast<std::size_t>(std::max(0, rows));
    shares.tags = all > others ? all - others : 0;
    return shares;
}

ScreenLine countsLine(const TableContent& content, LineBuilder line) {
    const QualityCounts& counts = content.counts;
    const std::size_t all = counts.good + counts.stale + counts.bad + counts.never;
    line.put(fmt::format("{} tag{}", all, all == 1 ? "" : "s"));
    const auto part = [&line](std::size_t count, const char* name, CellStyle style) {
        if (count != 0) line.put("  ").put(fmt::format("{} {}", count, name), style);
    };
    part(counts.bad, "bad", CellStyle::Bad);
    part(counts.stale, "stale", CellStyle::Warning);
    part(counts.never, "never", CellStyle::Dim);
    part(counts.good, "good", CellStyle::Good);
    if (!content.notice.empty()) line.put("  " + content.notice, CellStyle::Warning);
    return line.take();
}

/// Nodes in trouble are told first when there is no room for all.
std::vector<poll::NodeState> shownNodes(std::vector<poll::NodeState> nodes, std::size_t room) {
    if (nodes.size() <= room) return nodes;
    std::stable_partition(nodes.begin(), nodes.end(),
                          [](const poll::NodeState& node) { return !node.reachable; });
    nodes.resize(room);
    return nodes;
}

ScreenLine keysLine(const TableView& view, const Shares& shares, LineBuilder line) {
    if (view.typing()) return line.put("/" + view.filter() + "_").take();
    const std::size_t all = view.matching().size();
    const std::size_t last = std::min(all, view.top() + shares.tags);
    line.put(fmt::format("{}-{}/{}", std::min(all, view.top() + 1), last, all));
    if (!view.filter().empty())
        line.put(fmt::format("  /{}  Esc all", view.filter()), CellStyle::Warning);
    return line.put("  q quit  / filter  arrows PgUp PgDn", CellStyle::Dim).take();
}

}  // namespace

std::vector<ScreenLine> liveTable(const TableContent& content, const RowSource& rows,
                                  TableView& view, ScreenSize size, const TableStyle& style) {
    const Shares shares = sharesOf(size.rows, content.nodes.size());
    const LineBuilder empty(size.columns, style.unicode);
    const TableColumns columns(size.columns, style);
    view.fit(shares.tags);

    std::vector<ScreenLine> lines;
    lines.push_back(countsLine(content, empty));
    if (shares.titles) lines.push_back(columns.titles());
    for (std::size_t i = 0; i < shares.tags; ++i) {
        const std::size_t place = view.top() + i;
        const bool there = place < view.matching().size();
        lines.push_back(there ? columns.line(rows.row(view.matching()[place])) : ScreenLine{});
    }
    for (const poll::NodeState& node : shownNodes(content.nodes, shares.nodes)) {
        const CellStyle nodeStyle = node.reachable ? CellStyle::Plain : CellStyle::Bad;
        lines.push_back(LineBuilder(empty).put(nodeText(node), nodeStyle).take());
    }
    if (shares.line) {
        const CellStyle lineStyle = content.line.open ? CellStyle::Plain : CellStyle::Bad;
        lines.push_back(LineBuilder(empty).put(lineText(content.line), lineStyle).take());
    }
    if (shares.keys) lines.push_back(keysLine(view, shares, empty));
    lines.resize(std::min(lines.size(), static_cast<std::size_t>(std::max(0, size.rows))));
    return lines;
}

}  // namespace cli
