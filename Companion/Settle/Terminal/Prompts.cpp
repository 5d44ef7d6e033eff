#include "Settle/Terminal/Prompts.h"

#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Settle/Terminal/CarryOut.h"
#include "Settle/Terminal/ScreenWords.h"
#include "Settle/Terminal/SideTexts.h"

#include <algorithm>
#include <istream>
#include <optional>
#include <ostream>
#include <sstream>

namespace ovrin {

namespace {

constexpr std::size_t kColumns = 80;
constexpr std::size_t kMostOfValue = 400; // characters
constexpr const char* kQuestion =
    "o ours, t theirs, b base, n next, p previous, u undo, f finish, q leave, ? help: ";

class Prompts {
public:
    Prompts(Walk& walk, const Letters& letters, std::istream& input, std::ostream& output)
        : m_Walk(walk), m_Letters(letters), m_Input(input), m_Output(output) {}

    TerminalEnd Run();

private:
    void Tell(const std::string& text);
    void Tell(const std::vector<StyledLine>& lines);
    std::optional<std::string> Ask(const std::string& question);
    bool IsAgreed(const std::string& question);

    void TellPlace();
    void TellConflictHere(const SettleDesk::Item& item);
    void TellValues();

    void Answer(const std::string& answer);
    void Confirm();
    void TakeAll();
    void Search(const std::string& text);
    void Finish();

    Walk& m_Walk;
    const Letters m_Letters;
    std::istream& m_Input;
    std::ostream& m_Output;
    std::string m_Searched;
    TerminalEnd m_End;
    bool m_IsOver = false, m_IsToldAgain = true;
};

TerminalEnd Prompts::Run() {
    while (!m_IsOver) {
        if (m_IsToldAgain) TellPlace();
        m_IsToldAgain = true;
        const auto answer = Ask(kQuestion);
        if (!answer) break;
        Answer(*answer);
        Tell(m_Walk.Said());
        m_Walk.Say("");
    }
    return m_End;
}

/// Lines of text that may be anything.
void Prompts::Tell(const std::string& text) {
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) m_Output << m_Letters.Shown(line) << '\n';
}

void Prompts::Tell(const std::vector<StyledLine>& lines) {
    for (const StyledLine& line : lines) m_Output << TextOf(line) << '\n';
}

/// Nothing at the end of the input, which leaves.
std::optional<std::string> Prompts::Ask(const std::string& question) {
    m_Output << m_Letters.Shown(question) << std::flush;
    std::string answer;
    if (std::getline(m_Input, answer)) return answer;
    m_Output << '\n';
    m_IsOver = true;
    return {};
}

bool Prompts::IsAgreed(const std::string& question) {
    const auto answer = Ask(question + ": ");
    return answer && (*answer == "y" || *answer == "yes");
}

void Prompts::TellPlace() {
    const Walk::Stop& here = m_Walk.Here();
    m_Output << '\n';
    Tell(CountLine(m_Walk));
    Tell(TellSides(m_Walk.SceneOf(here).Source().occasion));
    if (const SettleDesk::Item* item = m_Walk.ItemOf(here))
        TellConflictHere(*item);
    else
        Tell(m_Walk.SceneOf(here).Source().isBothAdded
                 ? "Both sides added this scene, and it has the objects of both: v lists them, o takes it."
                 : "Nothing in this scene is in conflict.");
    Tell(ProblemLines(m_Walk, m_Letters));
}

void Prompts::TellConflictHere(const SettleDesk::Item& item) {
    const Walk::Stop& here = m_Walk.Here();
    Conflict words = m_Walk.WordsOf(here);
    for (std::string& value : words.words) value = ShortenedAtEnd(value, kMostOfValue);
    Tell(words.heading.empty() ? kOrderOfFields : words.heading);
    Tell(TellConflict(words, SideLabels::Of(m_Walk.SceneOf(here).Source().occasion)));
    if (!item.isOpen)
        Tell("  settled" + (item.decided ? ": " + m_Walk.NameOf(here, *item.decided) : ""));
    else if (item.decided)
        Tell("  you took " + m_Walk.NameOf(here, *item.decided) + ", but " + kStillLoop);
    else if (item.proposed)
        Tell("  decided before: " + m_Walk.NameOf(here, *item.proposed) + ", which Enter takes again");
}

void Prompts::TellValues() {
    const Walk::Stop& here = m_Walk.Here();
    const auto sides = here.item ? SideTextsOf(m_Walk, here, m_Letters, kColumns)
                                 : AddedObjectsOf(m_Walk, here, m_Letters, kColumns);
    for (const Side side : {Side::Base, Side::Ours, Side::Theirs}) {
        Tell(m_Walk.NameOf(here, side) + ":");
        Tell(sides[static_cast<std::size_t>(side)].lines);
    }
    m_IsToldAgain = false;
}

void Prompts::Answer(const std::string& answer) {
    if (answer.empty()) return Confirm();
    const Key key = KeyOf(answer.front());
    const auto request = RequestOf(key);
    if (request == Request::Search) return Search(answer.substr(1));
    if (!request || !IsForPrompts(*request) || answer.size() > 1) {
        m_IsToldAgain = false;
        return m_Walk.Say("\"" + answer + "\" is no answer; ? lists those that are");
    }
    switch (*request) {
    case Request::Help:
        m_IsToldAgain = false;
        return Tell(HelpLines(kColumns, m_Letters, true));
    case Request::ViewOn:
        return TellValues();
    case Request::All:
        return TakeAll();
    case Request::Finish:
        return Finish();
    case Request::Leave:
        m_IsOver = true;
        return;
    default:
        return CarryOut(m_Walk, *request, key);
    }
}

/// An empty answer takes what is proposed, and never what nobody has named.
void Prompts::Confirm() {
    const SettleDesk::Item* item = m_Walk.ItemOf(m_Walk.Here());
    if (item && item->isOpen && item->proposed) return m_Walk.Take(*item->proposed);
    m_Walk.GoToNextOpen();
}

void Prompts::TakeAll() {
    const auto answer = Ask(QuestionForSide(m_Walk) + ": ");
    const auto side = answer && answer->size() == 1 ? SideOf(KeyOf(answer->front())) : std::nullopt;
    if (side)
        m_Walk.TakeAll(*side);
    else
        m_Walk.Say("Nothing was decided");
}

void Prompts::Search(const std::string& text) {
    if (!text.empty()) m_Searched = text;
    if (m_Searched.empty()) return m_Walk.Say("Write what to search for behind the /");
    m_Walk.Find(m_Searched);
}

void Prompts::Finish() {
    if (NeedsQuestion(m_Walk)) {
        const std::string question = QuestionToFinish(m_Walk);
        if (question.empty()) return m_Walk.Say(NothingToFinish(m_Walk));
        if (!IsAgreed(question)) return;
    }
    for (const bool overwrite : {false, true}) {
        const auto finished = m_Walk.Finish(overwrite);
        if (!finished) return; // which was said
        m_End.finished.insert(m_End.finished.end(), finished->paths.begin(), finished->paths.end());
        m_End.refused = finished->refused;
        m_IsOver = true;
        const Remarks& changed = finished->changedByHand;
        if (overwrite || changed.empty() || !IsAgreed(QuestionToOverwrite(changed))) return;
    }
}

} // namespace

TerminalEnd SettleByPrompts(Walk& walk, const Letters& letters, std::istream& input, std::ostream& output) {
    return Prompts(walk, letters, input, output).Run();
}

} // namespace ovrin
