#pragma once

#include "Settle/Terminal/KeyTable.h"
#include "Settle/Terminal/TerminalEnd.h"
#include "Settle/Terminal/ValuePanes.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

/// The face of settling that fills a terminal, apart from the terminal: it makes lines of what there is, and
/// takes keys. The list at the left, the values at the right, below them what is missing and what was done,
/// and the keys at the bottom.
class Screen {
public:
    static constexpr Extent kLeast = {80, 24};

    /// Both stay.
    Screen(Walk& walk, const Letters& letters) : m_Walk(walk), m_Letters(letters) { Arrive(); }

    /// Exactly the lines of a terminal of that size.
    std::vector<StyledLine> Draw(Extent extent);
    void Press(Key key);
    /// Whether the key makes a step or finishes, for which scenes are merged.
    bool IsStep(Key key) const;
    /// The lines to be seen during a step that takes long.
    std::vector<StyledLine> DrawWorking(Extent extent);
    /// What was reached, once there is nothing left to press.
    const std::optional<TerminalEnd>& End() const { return m_End; }
    /// What was reached so far.
    const TerminalEnd& Reached() const { return m_Ended; }

private:
    enum class Mode : std::uint8_t {
        Walking,
        AskingSide,
        Searching,
        Helping,
        AskingToFinish,
        AskingToOverwrite
    };

    void Answer(Request request, Key key);
    void Confirm();
    void ChooseSide(int step);
    void AskSide(Key key);
    void Search(Key key);
    void Help(Key key);
    void AskToFinish();
    void Finish(bool overwrite);
    void Leave() { m_End = m_Ended; }
    void Arrive();

    std::string Question() const;
    StyledLine Bar(std::size_t columns) const;
    std::vector<StyledLine> Problems(Extent most) const;
    std::vector<StyledLine> Words(std::size_t columns) const;
    std::vector<StyledLine> Body(Extent extent);
    std::vector<StyledLine> HelpScreen(Extent extent);

    Walk& m_Walk;
    const Letters m_Letters;
    Mode m_Mode = Mode::Walking;
    bool m_IsWorking = false;
    std::string m_Typed, m_Searched;
    std::size_t m_ListTop = 0, m_HelpTop = 0;
    ValuePanes::Scroll m_Scroll;
    std::optional<Side> m_Chosen; ///< what Enter takes
    std::optional<ValuePanes> m_Panes;
    std::size_t m_PanesColumns = 0;
    TerminalEnd m_Ended;
    Remarks m_ChangedByHand;
    std::optional<TerminalEnd> m_End;
};

} // namespace ovrin
