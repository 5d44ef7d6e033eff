#include "Settle/Terminal/ValuePanes.h"

#include "Conflicts/ConflictReport.h"
#include "Settle/Terminal/KeyTable.h"

#include <algorithm>
#include <numeric>

namespace ovrin {

namespace {

constexpr Side kSides[] = {Side::Base, Side::Ours, Side::Theirs};
constexpr std::size_t kLeastPane = 32; // columns, side by side
constexpr std::size_t kGap = 2;

Style StyleOf(Side side) {
    return side == Side::Base ? Style::Base : side == Side::Ours ? Style::Ours : Style::Theirs;
}

/// How many lines each gets: what it wants, or an equal share of what others leave.
std::array<std::size_t, 3> Shares(const std::array<SideText, 3>& sides, std::size_t rows) {
    std::array<std::size_t, 3> shares{};
    while (rows > 0) {
        const auto before = shares;
        for (std::size_t at = 0; at < shares.size() && rows > 0; ++at)
            if (shares[at] < sides[at].lines.size()) {
                ++shares[at];
                --rows;
            }
        if (shares == before) break;
    }
    return shares;
}

/// "734813, theirs: Harbour/Lamp" behind the name.
StyledLine HeadingOf(const Conflict& conflict, const Letters& letters) {
    if (conflict.object.empty()) return {{kOrderOfFields, Style::Strong}};
    StyledLine line = {{letters.Shown(conflict.object), Style::Strong}};
    if (conflict.heading.starts_with(conflict.object))
        line.push_back({letters.Shown(conflict.heading.substr(conflict.object.size())), Style::Faint});
    return line;
}

} // namespace

ValuePanes::ValuePanes(const Walk& walk, const Letters& letters, std::size_t columns)
    : m_Letters(letters), m_Columns(columns), m_IsSideBySide(columns >= 3 * kLeastPane) {
    m_PaneColumns = m_IsSideBySide ? (columns - 2 * kGap) / 3 : columns - std::min(columns, kGap);
    const Walk::Stop& stop = walk.Here();
    m_Head = HeadOf(walk, stop);
    const SideLabels labels = SideLabels::Of(walk.SceneOf(stop).Source().occasion);
    for (const Side side : kSides) m_Labels[static_cast<std::size_t>(side)] = letters.Shown(labels.Of(side));
    if (const SettleDesk::Item* item = walk.ItemOf(stop)) {
        m_Taken = item->decided;
        m_Proposed = item->isOpen ? item->proposed : std::nullopt;
    }
    m_Sides = stop.item ? SideTextsOf(walk, stop, letters, m_PaneColumns)
                        : AddedObjectsOf(walk, stop, letters, m_PaneColumns);
}

std::vector<StyledLine> ValuePanes::HeadOf(const Walk& walk, const Walk::Stop& stop) const {
    std::vector<StyledLine> lines;
    const auto add = [&](const StyledLine& line) {
        for (StyledLine& wrapped : Wrapped(line, m_Columns)) lines.push_back(std::move(wrapped));
    };
    const SettleDesk::Item* item = walk.ItemOf(stop);
    if (item) {
        const Conflict& words = walk.WordsOf(stop);
        add(HeadingOf(words, m_Letters));
        StyledLine what;
        if (!words.property.empty()) what = {{m_Letters.Shown(words.property), Style::Strong}, {": "}};
        what.push_back({m_Letters.Shown(WhatHappened(words.kind))});
        add(what);
        if (!item->isOpen && !item->decided)
            add({{"settled by what was decided of another place", Style::Faint}});
        if (item->isOpen && item->proposed)
            add({{"decided before: " + walk.NameOf(stop, *item->proposed) + ", which Enter takes again"}});
    } else {
        add({{m_Letters.Shown(walk.SceneOf(stop).Source().path), Style::Strong}});
        add({{"Both sides added this scene, and it has the objects of both. What one side removed can't be "
              "told from what the other added: look through it, and take it with Enter."}});
    }
    std::string sides = TellSides(walk.SceneOf(stop).Source().occasion);
    if (sides.ends_with('\n')) sides.pop_back();
    if (!sides.empty()) add({{m_Letters.Shown(sides), Style::Faint}});
    return lines;
}

/// "o ours  main                taken": the key, the side, the branch, and what is to be said of it.
StyledLine ValuePanes::TitleOf(Side side, std::size_t height, std::size_t from,
                               std::optional<Side> chosen) const {
    const auto at = static_cast<std::size_t>(side);
    const std::size_t count = m_Sides[at].lines.size();
    std::string right;
    if (height < count)
        right =
            std::to_string(from + 1) + "-" + std::to_string(from + height) + " of " + std::to_string(count);
    if (m_Taken == side) right += (right.empty() ? "" : "  ") + std::string("taken");
    if (chosen == side && m_Taken != side) right += (right.empty() ? "" : "  ") + std::string("Enter takes");
    const StyledLine left = {{std::string(1, LetterOf(side)), Style::Key},
                             {std::string(" ") + SideName(side), StyleOf(side)},
                             {m_Labels[at].empty() ? "" : "  " + m_Labels[at], Style::Plain}};
    const std::size_t columns = m_IsSideBySide ? m_PaneColumns : m_Columns;
    const std::size_t taken = std::min(columns, right.empty() ? 0 : ColumnsOf(right) + 1);
    StyledLine title = Fitted(left, columns - taken);
    if (taken) title.push_back({" " + right, Style::Faint});
    if (chosen == side)
        for (StyledSpan& span : title) span.style = Style::Selected;
    return title;
}

std::vector<StyledLine> ValuePanes::Pane(Side side, std::size_t height, std::size_t scroll,
                                         std::optional<Side> chosen) const {
    const SideText& text = m_Sides[static_cast<std::size_t>(side)];
    const std::size_t from = std::min(scroll, text.lines.size() - std::min(height, text.lines.size()));
    std::vector<StyledLine> lines = {TitleOf(side, height, from, chosen)};
    for (std::size_t at = from; at < std::min(from + height, text.lines.size()); ++at) {
        StyledLine line = {{m_IsSideBySide ? "" : std::string(kGap, ' ')}};
        Append(line, text.lines[at]);
        lines.push_back(std::move(line));
    }
    return lines;
}

/// The first line that is shown of the panes that don't show all.
std::size_t ValuePanes::Settle(Scroll& scroll, const std::array<std::size_t, 3>& heights) {
    std::size_t furthest = 0, first = std::string::npos;
    m_Page = std::string::npos;
    for (std::size_t at = 0; at < m_Sides.size(); ++at) {
        const std::size_t count = m_Sides[at].lines.size();
        if (count <= heights[at]) continue;
        furthest = std::max(furthest, count - heights[at]);
        first = std::min(first, m_Sides[at].firstDifference);
        m_Page =
            std::min(m_Page, std::max<std::size_t>(1, heights[at] - std::min<std::size_t>(1, heights[at])));
    }
    if (scroll) scroll = std::min(*scroll, furthest);
    if (furthest == 0) m_Page = 1;
    return scroll.value_or(
        first == std::string::npos ? 0 : std::min(first - std::min<std::size_t>(1, first), furthest));
}

std::vector<StyledLine> ValuePanes::Stacked(std::size_t rows, Scroll& scroll, std::optional<Side> chosen) {
    const std::size_t ruled = std::min<std::size_t>(rows, 5); // three titles, two blank lines
    const auto heights = Shares(m_Sides, rows - ruled);
    const std::size_t from = Settle(scroll, heights);
    if (!scroll && from > 0) scroll = from;
    std::vector<StyledLine> lines;
    for (const Side side : kSides) {
        if (!lines.empty()) lines.emplace_back();
        for (StyledLine& line : Pane(side, heights[static_cast<std::size_t>(side)], from, chosen))
            lines.push_back(std::move(line));
    }
    return lines;
}

std::vector<StyledLine> ValuePanes::SideBySide(std::size_t rows, Scroll& scroll, std::optional<Side> chosen) {
    const std::size_t height = rows - std::min<std::size_t>(rows, 1);
    const std::size_t from = Settle(scroll, {height, height, height});
    if (!scroll && from > 0) scroll = from;
    std::vector<StyledLine> lines(rows);
    for (const Side side : kSides) {
        std::vector<StyledLine> pane = Pane(side, height, from, chosen);
        pane.resize(rows);
        for (std::size_t at = 0; at < rows; ++at) {
            if (side != Side::Base) lines[at].push_back({std::string(kGap, ' ')});
            Append(lines[at], Fitted(pane[at], m_PaneColumns));
        }
    }
    return lines;
}

std::vector<StyledLine> ValuePanes::Draw(std::size_t rows, Scroll& scroll, std::optional<Side> chosen) {
    // The values need their titles and a line each.
    constexpr std::size_t kLeastRows = 9;
    std::vector<StyledLine> lines = m_Head;
    lines.resize(std::min(lines.size(), rows - std::min(rows, kLeastRows)));
    lines.emplace_back();
    const std::size_t rest = rows - std::min(rows, lines.size());
    for (StyledLine& line : m_IsSideBySide ? SideBySide(rest, scroll, chosen) : Stacked(rest, scroll, chosen))
        lines.push_back(std::move(line));
    lines.resize(rows);
    for (StyledLine& line : lines) line = Fitted(line, m_Columns);
    return lines;
}

} // namespace ovrin
