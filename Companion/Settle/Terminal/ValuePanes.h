#pragma once

#include "Settle/Terminal/ConflictList.h"
#include "Settle/Terminal/SideTexts.h"

#include <array>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

/// The place at which a person stands: what it is about, and what base, ours and theirs have there, below
/// each other or, where there is room, side by side. Made once for a place and a width, drawn many times.
class ValuePanes {
public:
    ValuePanes(const Walk& walk, const Letters& letters, std::size_t columns);

    /// How far the values are scrolled; nothing: to the first difference.
    using Scroll = std::optional<std::size_t>;
    /// Exactly so many lines. A scroll beyond the end is brought back. `chosen` is the side that Enter takes.
    std::vector<StyledLine> Draw(std::size_t rows, Scroll& scroll, std::optional<Side> chosen);
    /// By how many lines the last drawing can be scrolled at once.
    std::size_t Page() const { return m_Page; }

private:
    std::vector<StyledLine> HeadOf(const Walk& walk, const Walk::Stop& stop) const;
    StyledLine TitleOf(Side side, std::size_t height, std::size_t from, std::optional<Side> chosen) const;
    std::vector<StyledLine> Pane(Side side, std::size_t height, std::size_t scroll,
                                 std::optional<Side> chosen) const;
    std::vector<StyledLine> Stacked(std::size_t rows, Scroll& scroll, std::optional<Side> chosen);
    std::vector<StyledLine> SideBySide(std::size_t rows, Scroll& scroll, std::optional<Side> chosen);
    std::size_t Settle(Scroll& scroll, const std::array<std::size_t, 3>& heights);

    const Letters m_Letters;
    const std::size_t m_Columns;
    const bool m_IsSideBySide;
    std::size_t m_PaneColumns;
    std::vector<StyledLine> m_Head;
    std::array<std::string, 3> m_Labels; ///< branches, shown
    std::optional<Side> m_Taken, m_Proposed;
    std::array<SideText, 3> m_Sides;
    std::size_t m_Page = 1;
};

} // namespace ovrin
