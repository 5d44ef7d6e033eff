#include "Settle/Terminal/ConflictList.h"

#include <algorithm>
#include <cstdint>
#include <optional>

namespace ovrin {

namespace {

struct ListRow {
    enum Kind : std::uint8_t { Scene, Object, Stop } kind;
    std::size_t stop; ///< of a heading the first below it
};

/// All rows: a few instructions each, so that it costs less to make them anew than to keep them.
std::vector<ListRow> ListRowsOf(const Walk& walk) {
    std::vector<ListRow> rows;
    const std::vector<Walk::Stop>& stops = walk.Stops();
    const bool hasScenes = walk.Desk().Scenes().size() > 1;
    for (std::size_t at = 0; at < stops.size(); ++at) {
        if (hasScenes && (at == 0 || stops[at].scene != stops[at - 1].scene))
            rows.push_back({ListRow::Scene, at});
        const SettleDesk::Item* item = walk.ItemOf(stops[at]);
        if (item && item->object == *stops[at].item) rows.push_back({ListRow::Object, at});
        rows.push_back({ListRow::Stop, at});
    }
    return rows;
}

/// What stands at the left, cut to what the right leaves.
StyledLine Row(const StyledSpan& left, const StyledSpan& right, std::size_t columns, const Letters& letters) {
    const std::size_t taken = right.text.empty() ? 0 : ColumnsOf(right.text) + 1;
    StyledLine row = {{EndWithin(left.text, columns - std::min(columns, taken), letters), left.style}};
    if (right.text.empty()) return Fitted(row, columns);
    row = Fitted(row, columns - taken);
    row.push_back({" "});
    row.push_back(right);
    return row;
}

Style StyleOf(Side side) {
    return side == Side::Base ? Style::Base : side == Side::Ours ? Style::Ours : Style::Theirs;
}

StyledSpan StateOf(const SettleDesk::Item& item) {
    if (item.isOpen && item.proposed) return {SideName(*item.proposed) + std::string("?"), Style::Faint};
    if (item.isOpen && !item.decided) return {};
    return item.decided ? StyledSpan{SideName(*item.decided), StyleOf(*item.decided)}
                        : StyledSpan{"settled", Style::Faint};
}

StyledLine StopRow(const Walk& walk, const Walk::Stop& stop, std::size_t columns, const Letters& letters) {
    const SettleDesk::Item* item = walk.ItemOf(stop);
    const bool isOpen = walk.IsOpen(stop);
    std::string name = walk.SceneOf(stop).Source().isBothAdded ? "added by both" : "no conflict";
    if (item) {
        const Conflict& words = walk.WordsOf(stop);
        name = words.property.empty() ? "whole object" : letters.Shown(words.property);
    }
    const StyledSpan state = item ? StateOf(*item) : StyledSpan{isOpen ? "" : "settled", Style::Faint};
    StyledLine row = {{isOpen ? letters.Shown(" • ") : "   ", Style::Warning}};
    Append(row, Row({name, isOpen ? Style::Plain : Style::Faint}, state,
                    columns - std::min(columns, std::size_t{3}), letters));
    return row;
}

StyledLine Draw(const Walk& walk, const ListRow& row, std::size_t columns, const Letters& letters) {
    const Walk::Stop& stop = walk.Stops()[row.stop];
    if (row.kind == ListRow::Stop) return StopRow(walk, stop, columns, letters);
    if (row.kind == ListRow::Object) {
        return Row({letters.Shown(walk.ObjectOf(stop)), Style::Strong}, {}, columns, letters);
    }
    const SettleSession& scene = walk.SceneOf(stop);
    const std::size_t open = scene.Open().size();
    const std::string state = open ? std::to_string(open) + " open" : scene.IsSettled() ? "settled" : "";
    return Row({letters.Shown(scene.Source().path), Style::Key}, {state, Style::Faint}, columns, letters);
}

/// Keeps the selected row in sight, with the headings ahead of it.
void Adjust(const std::vector<ListRow>& rows, std::size_t selected, std::size_t height, std::size_t& top) {
    std::size_t first = selected;
    while (first > 0 && rows[first - 1].kind != ListRow::Stop) --first;
    top = std::min(top, first);
    if (selected >= top + height) top = selected - height + 1;
    top = std::min(top, rows.size() > height ? rows.size() - height : 0);
}

} // namespace

std::vector<StyledLine> ConflictListLines(const Walk& walk, const Letters& letters, Extent extent,
                                          std::size_t& top) {
    const std::vector<ListRow> rows = ListRowsOf(walk);
    const auto selected = std::ranges::find_if(
        rows, [&](const ListRow& row) { return row.kind == ListRow::Stop && row.stop == walk.At(); });
    Adjust(rows, static_cast<std::size_t>(selected - rows.begin()), extent.rows, top);
    std::vector<StyledLine> lines;
    for (std::size_t at = top; at < rows.size() && lines.size() < extent.rows; ++at) {
        lines.push_back(Fitted(Draw(walk, rows[at], extent.columns, letters), extent.columns));
        if (rows.begin() + static_cast<std::ptrdiff_t>(at) != selected) continue;
        for (StyledSpan& span : lines.back()) span.style = Style::Selected;
    }
    lines.resize(extent.rows, Fitted({}, extent.columns));
    return lines;
}

} // namespace ovrin
