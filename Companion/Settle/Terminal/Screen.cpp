#include "Settle/Terminal/Screen.h"

#include "Settle/Terminal/CarryOut.h"
#include "Settle/Terminal/ScreenWords.h"

#include <algorithm>

namespace ovrin {

namespace {

constexpr std::size_t kMostWords = 4; // lines of what is said

bool IsText(Key key) {
    return key >= KeyOf(' ') && key < Key::Up && key != static_cast<Key>(0x7F);
}

/// The key's character in UTF-8.
std::string TextOf(Key key) {
    const auto point = static_cast<std::uint32_t>(key);
    const auto byte = [](std::uint32_t bits) { return static_cast<char>(bits); };
    if (point < 0x80) return {byte(point)};
    if (point < 0x800) return {byte(0xC0 | (point >> 6)), byte(0x80 | (point & 63))};
    if (point < 0x10000)
        return {byte(0xE0 | (point >> 12)), byte(0x80 | ((point >> 6) & 63)), byte(0x80 | (point & 63))};
    return {byte(0xF0 | (point >> 18)), byte(0x80 | ((point >> 12) & 63)), byte(0x80 | ((point >> 6) & 63)),
            byte(0x80 | (point & 63))};
}

void EraseLast(std::string& text) {
    while (!text.empty() && (text.back() & 0xC0) == 0x80) text.pop_back();
    if (!text.empty()) text.pop_back();
}

} // namespace

/// Another place is shown from its first difference on, and Enter takes what is settled or proposed there.
void Screen::Arrive() {
    m_Panes.reset();
    m_Scroll.reset();
    const SettleDesk::Item* item = m_Walk.ItemOf(m_Walk.Here());
    m_Chosen = !item ? std::nullopt : item->isOpen ? item->proposed : item->decided;
}

void Screen::Press(Key key) {
    if (key == Key::Redraw) return;
    switch (m_Mode) {
    case Mode::Walking:
        if (const auto request = RequestOf(key)) return Answer(*request, key);
        if (key != Key::Escape) m_Walk.Say("That key does nothing here; ? lists those that do");
        return;
    case Mode::AskingSide:
        return AskSide(key);
    case Mode::Searching:
        return Search(key);
    case Mode::Helping:
        return Help(key);
    case Mode::AskingToFinish:
    case Mode::AskingToOverwrite: {
        const bool mayOverwrite = m_Mode == Mode::AskingToOverwrite;
        m_Mode = Mode::Walking;
        if (key == KeyOf('y')) return Finish(mayOverwrite);
        if (mayOverwrite && key == KeyOf('n')) return Leave();
        return m_Walk.Say("Nothing was finished");
    }
    }
}

bool Screen::IsStep(Key key) const {
    switch (m_Mode) {
    case Mode::AskingSide:
        return SideOf(key).has_value();
    case Mode::AskingToFinish:
    case Mode::AskingToOverwrite:
        return key == KeyOf('y');
    case Mode::Walking: {
        const auto request = RequestOf(key);
        return request &&
               (MakesStep(*request) || *request == Request::Finish || *request == Request::Confirm);
    }
    default:
        return false;
    }
}

void Screen::Answer(Request request, Key key) {
    switch (request) {
    case Request::Help:
        m_HelpTop = 0;
        m_Mode = Mode::Helping;
        return;
    case Request::Search:
        m_Typed.clear();
        m_Mode = Mode::Searching;
        return;
    case Request::All:
        m_Mode = Mode::AskingSide;
        return;
    case Request::Finish:
        return AskToFinish();
    case Request::Leave:
        return Leave();
    case Request::SideBefore:
        return ChooseSide(2);
    case Request::SideBehind:
        return ChooseSide(1);
    case Request::ViewOn:
        m_Scroll = m_Scroll.value_or(0) + (m_Panes ? m_Panes->Page() : 1);
        return;
    case Request::ViewBack:
        m_Scroll = m_Scroll.value_or(0) - std::min(m_Scroll.value_or(0), m_Panes ? m_Panes->Page() : 1);
        return;
    case Request::Confirm:
        return Confirm();
    default:
        CarryOut(m_Walk, request, key);
        Arrive();
    }
}

void Screen::Confirm() {
    if (m_Walk.CountOpen() == 0) return AskToFinish();
    const Walk::Stop& here = m_Walk.Here();
    const SettleDesk::Item* item = m_Walk.ItemOf(here);
    if (!m_Walk.IsOpen(here) && (!item || item->decided == m_Chosen))
        m_Walk.GoToNextOpen();
    else if (!item || m_Chosen)
        m_Walk.Take(m_Chosen.value_or(Side::Ours));
    else
        return m_Walk.Say(m_Letters.Shown("Choose a side with ← and → first, or press o, t or b"));
    Arrive();
}

/// From no choice the arrow to the right leads to the base, and the other one to theirs.
void Screen::ChooseSide(int step) {
    if (!m_Walk.Here().item) return;
    const int none = step == 1 ? 2 : 0;
    m_Chosen = static_cast<Side>((m_Chosen ? static_cast<int>(*m_Chosen) + step : none + step) % 3);
}

void Screen::AskSide(Key key) {
    m_Mode = Mode::Walking;
    const auto side = SideOf(key);
    if (!side) return m_Walk.Say("Nothing was decided");
    m_Walk.TakeAll(*side);
    Arrive();
}

void Screen::Search(Key key) {
    if (key == Key::Erase) return EraseLast(m_Typed);
    if (IsText(key)) {
        m_Typed += TextOf(key);
        return;
    }
    m_Mode = Mode::Walking;
    if (key != Key::Enter) return;
    if (!m_Typed.empty()) m_Searched = m_Typed;
    if (m_Searched.empty()) return m_Walk.Say("Nothing was searched for before");
    m_Walk.Find(m_Searched);
    Arrive();
}

void Screen::Help(Key key) {
    const auto request = RequestOf(key);
    if (request == Request::Down || request == Request::ViewOn)
        ++m_HelpTop;
    else if (request == Request::Up || request == Request::ViewBack)
        m_HelpTop -= std::min<std::size_t>(m_HelpTop, 1);
    else
        m_Mode = Mode::Walking;
}

void Screen::AskToFinish() {
    if (!NeedsQuestion(m_Walk)) return Finish(false);
    if (QuestionToFinish(m_Walk).empty()) return m_Walk.Say(NothingToFinish(m_Walk));
    m_Mode = Mode::AskingToFinish;
}

void Screen::Finish(bool overwrite) {
    const auto finished = m_Walk.Finish(overwrite);
    m_Panes.reset();
    if (!finished) return; // which was said
    m_Ended.finished.insert(m_Ended.finished.end(), finished->paths.begin(), finished->paths.end());
    m_Ended.refused = finished->refused;
    m_ChangedByHand = finished->changedByHand;
    if (m_ChangedByHand.empty() || overwrite) return Leave();
    m_Mode = Mode::AskingToOverwrite;
}

std::string Screen::Question() const {
    if (m_IsWorking) return "Working…";
    switch (m_Mode) {
    case Mode::AskingSide:
        return QuestionForSide(m_Walk) + ", any other key: none";
    case Mode::Searching:
        return "Search: " + m_Typed + "_";
    case Mode::AskingToFinish:
        return QuestionToFinish(m_Walk);
    case Mode::AskingToOverwrite:
        return QuestionToOverwrite(m_ChangedByHand);
    default:
        return m_Walk.Said();
    }
}

StyledLine Screen::Bar(std::size_t columns) const {
    const std::string left = " " + m_Letters.Shown(CountLine(m_Walk));
    const std::string right = m_Letters.Shown(SidesLine(m_Walk)) + " ";
    std::string text = BeginningWithin(left, columns, m_Letters);
    const std::size_t used = ColumnsOf(text) + ColumnsOf(right) + 1;
    if (used <= columns) text += std::string(columns - used + 1, ' ') + right;
    return Fitted({{text, Style::Bar}}, columns, Style::Bar);
}

std::vector<StyledLine> Screen::Problems(Extent most) const {
    std::vector<StyledLine> lines;
    for (const StyledLine& problem : ProblemLines(m_Walk, m_Letters))
        for (StyledLine& wrapped : Wrapped(problem, most.columns)) lines.push_back(std::move(wrapped));
    if (lines.size() <= most.rows) return lines;
    lines.resize(most.rows - 1);
    lines.push_back({{m_Letters.Shown(" … and more, of " + std::to_string(m_Walk.Desk().Problems().size())),
                      Style::Warning}});
    return lines;
}

std::vector<StyledLine> Screen::Words(std::size_t columns) const {
    const Style style = m_Mode == Mode::Walking ? Style::Plain : Style::Key;
    std::vector<StyledLine> lines = Wrapped({{" " + m_Letters.Shown(Question()), style}}, columns);
    // The end of a question says what can be answered.
    if (lines.size() > kMostWords)
        lines.erase(lines.begin(), lines.end() - static_cast<std::ptrdiff_t>(kMostWords));
    return lines;
}

std::vector<StyledLine> Screen::Body(Extent extent) {
    const std::size_t list = std::clamp(extent.columns * 3 / 8, std::size_t{30}, std::size_t{56});
    const std::size_t values = extent.columns - list - 3;
    if (!m_Panes || m_PanesColumns != values) m_Panes.emplace(m_Walk, m_Letters, m_PanesColumns = values);
    const auto left = ConflictListLines(m_Walk, m_Letters, {list, extent.rows}, m_ListTop);
    const auto right = m_Panes->Draw(extent.rows, m_Scroll, m_Chosen);
    std::vector<StyledLine> lines(extent.rows);
    for (std::size_t at = 0; at < extent.rows; ++at) {
        lines[at] = left[at];
        lines[at].push_back({" " + m_Letters.Shown("│") + " ", Style::Faint});
        Append(lines[at], right[at]);
    }
    return lines;
}

std::vector<StyledLine> Screen::HelpScreen(Extent extent) {
    std::vector<StyledLine> lines = {Fitted({{" Help", Style::Bar}}, extent.columns, Style::Bar), {}};
    std::vector<StyledLine> all = HelpLines(extent.columns - 1, m_Letters, false);
    const std::size_t rows = extent.rows - 4;
    m_HelpTop = std::min(m_HelpTop, all.size() - std::min(all.size(), rows));
    all.erase(all.begin(), all.begin() + static_cast<std::ptrdiff_t>(m_HelpTop));
    const bool isMore = all.size() > rows || m_HelpTop > 0;
    all.resize(rows);
    lines.insert(lines.end(), all.begin(), all.end());
    lines.emplace_back();
    lines.push_back(
        {{m_Letters.Shown(isMore ? " ↑ and ↓ scroll, any other key goes back" : " Any key goes back"),
          Style::Key}});
    return lines;
}

std::vector<StyledLine> Screen::DrawWorking(Extent extent) {
    m_IsWorking = true;
    std::vector<StyledLine> lines = Draw(extent);
    m_IsWorking = false;
    return lines;
}

std::vector<StyledLine> Screen::Draw(Extent extent) {
    std::vector<StyledLine> lines;
    if (extent.columns < kLeast.columns || extent.rows < kLeast.rows) {
        lines = TooSmall(extent, kLeast);
    } else if (m_Mode == Mode::Helping) {
        lines = HelpScreen(extent);
    } else {
        const auto keys = KeyLines(extent.columns, m_Letters);
        const auto words = Words(extent.columns);
        const auto problems = Problems({extent.columns, extent.rows / 4});
        lines = {Bar(extent.columns)};
        const std::size_t taken = 1 + keys.size() + words.size() + problems.size();
        for (const auto& part : {Body({extent.columns, extent.rows - taken}), problems, words, keys})
            lines.insert(lines.end(), part.begin(), part.end());
    }
    lines.resize(extent.rows);
    for (StyledLine& line : lines) line = Fitted(line, extent.columns);
    return lines;
}

} // namespace ovrin
