#include "Settle/Terminal/ValuePanes.h"

#include "Conflicts/ConflictReport.h"
#include "Settle/Terminal/KeyTable.h"

#include <algorithm>

namespace ovrin {

namespace {

constexpr Side kSides[] = {Side::Base, Side::Ours, Side::Theirs};
constexpr std::size_t kLeastPane = 32; // columns, side by side
constexpr std::size_t kGap = 2;

Style StyleOf(Side side) {
    return side == Side::Base ? Style::Base : side == Side::Ours ? Style::Ours : Style::Theirs;
}

bool DidSomething(const SideText& side) {
    return !side.what.empty();
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

/// The name, and behind it the id and the names that other sides have.
StyledLine HeadingOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters) {
    const std::string name = walk.ObjectOf(stop), &heading = walk.WordsOf(stop).heading;
    StyledLine line = {{letters.Shown(name), Style::Strong}};
    if (heading.starts_with(name)) line.push_back({letters.Shown(heading.substr(name.size())), Style::Faint});
    return line;
}

std::vector<StyledLine> ConflictHead(const Walk& walk, const Walk::Stop& stop, const Letters& letters) {
    const Conflict& words = walk.WordsOf(stop);
    const SettleDesk::Item& item = *walk.ItemOf(stop);
    StyledLine what;
    if (!words.property.empty()) what = {{letters.Shown(words.property), Style::Strong}, {": "}};
    what.push_back({letters.Shown(WhatHappened(words.kind))});
    std::vector<StyledLine> lines = {HeadingOf(walk, stop, letters), what};
    if (!item.isOpen && !item.decided)
        lines.push_back({{"settled by what was decided of another place", Style::Faint}});
    if (item.isOpen && item.decided)
        lines.push_back(
            {{letters.Shown("you took " + walk.NameOf(stop, *item.decided) + ", but " + kStillLoop),
              Style::Warning}});
    else if (item.isOpen && item.proposed)
        lines.push_back({{letters.Shown("decided before: " + walk.NameOf(stop, *item.proposed) +
                                        ", which Enter takes again")}});
    return lines;
}

std::string WhyWithoutConflict(const Walk& walk, const Walk::Stop& stop) {
    if (!walk.SceneOf(stop).Source().isBothAdded) return "Nothing in this scene is in conflict.";
    return "Both sides added this scene, and it has the objects of both. What one side removed can't be told "
           "from what the other added: look through it, and take it with Enter.";
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
    if (stop.item)
        for (const StyledLine& line : ConflictHead(walk, stop, m_Letters)) add(line);
    else
        add({{m_Letters.Shown(walk.SceneOf(stop).Source().path), Style::Strong}});
    if (!stop.item) add({{WhyWithoutConflict(walk, stop)}});
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
    const std::size_t columns = m_IsSideBySide ? m_PaneColumns : m_Columns;
    const std::size_t taken = std::min(columns, right.empty() ? 0 : ColumnsOf(right) + 1);
    const StyledLine key = {{std::string(1, LetterOf(side)), Style::Key},
                            {std::string(" ") + SideName(side), StyleOf(side)}};
    const std::size_t rest = columns - std::min(columns, taken + ColumnsOf(key));
    StyledLine title = key;
    if (!m_Labels[at].empty()) title.push_back({BeginningWithin("  " + m_Labels[at], rest, m_Letters)});
    title = Fitted(title, columns - taken);
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
    const StyledLine margin = {{m_IsSideBySide ? "" : std::string(kGap, ' ')}};
    const auto add = [&](const StyledLine& text) {
        lines.push_back(margin);
        Append(lines.back(), text);
    };
    if (!text.what.empty())
        add({{BeginningWithin(TextOf(text.what), m_PaneColumns, m_Letters), text.what.front().style}});
    for (std::size_t at = from; at < std::min(from + height, text.lines.size()); ++at) add(text.lines[at]);
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
    // Three titles and two blank lines.
    const std::size_t ruled = 5 + static_cast<std::size_t>(std::ranges::count_if(m_Sides, DidSomething));
    const auto heights = Shares(m_Sides, rows - std::min(rows, ruled));
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
    const std::size_t ruled = std::ranges::any_of(m_Sides, DidSomething) ? 2 : 1;
    const std::size_t height = rows - std::min(rows, ruled);
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
