#include "Settle/Terminal/Walk.h"

#include "Names/PrintableText.h"
#include "Words/Failure.h"

#include <algorithm>
#include <cctype>
#include <set>
#include <string_view>
#include <utility>

namespace ovrin {

namespace {

std::string Counted(std::size_t count, const char* one, const char* many) {
    return std::to_string(count) + " " + (count == 1 ? one : many);
}

bool Contains(std::string_view text, std::string_view part) {
    const auto isSame = [](unsigned char a, unsigned char b) { return std::tolower(a) == std::tolower(b); };
    return std::search(text.begin(), text.end(), part.begin(), part.end(), isSame) != text.end();
}

} // namespace

Walk::Walk(SettleDesk& desk) : m_Desk(desk) {
    Refresh();
    if (const auto first = OpenFrom(m_Stops.size() - 1, true)) m_At = *first;
}

/// A scene without conflicts stands between those of the scenes around it.
void Walk::Refresh() {
    m_Stops.clear();
    m_Words.clear();
    std::size_t item = 0;
    for (std::size_t scene = 0; scene < m_Desk.Scenes().size(); ++scene) {
        if (m_Desk.Scenes()[scene]->CountMet() == 0) m_Stops.push_back({scene, {}});
        for (; item < m_Desk.Items().size() && m_Desk.Items()[item].scene == scene; ++item)
            m_Stops.push_back({scene, item});
    }
    m_Open = static_cast<std::size_t>(
        std::ranges::count_if(m_Stops, [&](const Stop& stop) { return IsOpen(stop); }));
}

bool Walk::IsOpen(const Stop& stop) const {
    return stop.item ? ItemOf(stop)->isOpen : !SceneOf(stop).IsSettled();
}

const Conflict& Walk::WordsOf(const Stop& stop) const {
    const SettleDesk::Item& item = *ItemOf(stop);
    const auto known = m_Words.find(item.about);
    return known != m_Words.end() ? known->second
                                  : m_Words.emplace(item.about, m_Desk.Describe(item)).first->second;
}

std::string Walk::ObjectOf(const Stop& stop) const {
    const MergeNames& names = SceneOf(stop).Names();
    const MergeNames::ID id = ItemOf(stop)->about->path.front();
    const auto version = names.Leading(id);
    return version ? names.In(*version).Name(id) : kOrderOfFields;
}

std::string Walk::NameOf(const Stop& stop) const {
    if (!stop.item) return SceneOf(stop).Source().path;
    const std::string& property = WordsOf(stop).property;
    return ObjectOf(stop) + (property.empty() ? "" : " · " + property);
}

std::string Walk::NameOf(const Stop& stop, Side side) const {
    const Occasion& occasion = SceneOf(stop).Source().occasion;
    const std::string& label = side == Side::Base   ? occasion.base
                               : side == Side::Ours ? occasion.ours
                                                    : occasion.theirs;
    return SideName(side) + (label.empty() ? "" : " (" + Printable(label) + ")");
}

std::optional<std::size_t> Walk::OpenFrom(std::size_t from, bool isForward) const {
    for (std::size_t i = 1; i <= m_Stops.size(); ++i) {
        const std::size_t at = (from + (isForward ? i : m_Stops.size() - i)) % m_Stops.size();
        if (IsOpen(m_Stops[at])) return at;
    }
    return {};
}

void Walk::GoToNextOpen() {
    m_Said.clear();
    if (const auto next = OpenFrom(m_At, true))
        m_At = *next;
    else
        m_Said = "Nothing is open any more: f finishes";
}

void Walk::GoToPreviousOpen() {
    m_Said.clear();
    if (const auto previous = OpenFrom(m_At, false))
        m_At = *previous;
    else
        m_Said = "Nothing is open any more: f finishes";
}

/// By any name that a version has for it. Words aren't kept of what may be the whole list.
bool Walk::IsCalled(const Stop& stop, const std::string& text) const {
    if (Contains(SceneOf(stop).Source().path, text)) return true;
    if (!stop.item) return false;
    const Conflict words = m_Desk.Describe(*ItemOf(stop));
    return Contains(words.object, text) || Contains(words.property, text);
}

void Walk::Find(const std::string& text) {
    for (std::size_t i = 1; i <= m_Stops.size(); ++i) {
        const std::size_t at = (m_At + i) % m_Stops.size();
        const Stop& stop = m_Stops[at];
        if (!IsCalled(stop, text)) continue;
        m_At = at;
        m_Said = "Found \"" + text + "\"; / and Enter goes to the next one";
        return;
    }
    m_Said = "No object and no property here is called like \"" + text + "\"";
}

/// Makes a step and stays at the same place, wherever that is in the list then. False if it failed.
template <class Make> bool Walk::Do(const Make& make) {
    const std::size_t scene = Here().scene;
    const OpenConflict* const about = Here().item ? ItemOf(Here())->about : nullptr;
    m_Said.clear();
    bool isDone = true;
    try {
        make();
    } catch (const Failure& failure) {
        m_Said = failure.what();
        isDone = false;
    }
    Refresh();
    const auto found = std::ranges::find_if(m_Stops, [&](const Stop& stop) {
        return stop.scene == scene && (stop.item ? ItemOf(stop)->about == about : !about);
    });
    m_At = found == m_Stops.end() ? 0 : static_cast<std::size_t>(found - m_Stops.begin());
    return isDone;
}

void Walk::TellStep(const std::string& what, const SettleDesk::Step& step) {
    m_Said = what;
    if (step.settled > 1) m_Said += ": " + Counted(step.settled, "conflict", "conflicts") + " settled";
    if (step.followed)
        m_Said +=
            ", with " + Counted(step.followed, "decision that follows", "decisions that follow") + " from it";
    if (m_Open == 0)
        m_Said += m_Desk.Problems().empty()
                      ? ". All is settled: f finishes"
                      : ". All is settled but for what is told here: f finishes as it is";
    if (!IsOpen(Here()))
        if (const auto next = OpenFrom(m_At, true)) m_At = *next;
}

void Walk::Take(Side side) {
    if (!Here().item && !IsOpen(Here())) return Say("There is nothing to decide in this scene");
    const std::string what = NameOf(Here()) + ": " + NameOf(Here(), side);
    SettleDesk::Step step;
    const Stop here = Here();
    if (Do([&] { step = here.item ? m_Desk.Take(*here.item, side) : m_Desk.Accept(here.scene); }))
        TellStep(here.item ? what : "The scene is taken as it is", step);
}

void Walk::TakeWhole(Side side) {
    if (!Here().item) return Take(side);
    const std::string object = ObjectOf(Here()), what = NameOf(Here(), side);
    SettleDesk::Step step;
    const std::size_t item = *Here().item;
    if (!Do([&] { step = m_Desk.TakeUnder(item, side); })) return;
    TellStep("Took " + what + " for " + object + " and what stands under it", step);
    if (step.settled == 0) m_Said = "Nothing is open about " + object + " and what stands under it";
}

void Walk::TakeAll(Side side) {
    SettleDesk::Step step;
    if (m_Open == 0) return Say("Nothing is open any more: f finishes");
    const std::size_t before = m_Open;
    if (Do([&] { step = m_Desk.TakeAll(side); }))
        TellStep(std::string("Took ") + SideName(side) + " for all that was open", step);
    if (m_Open > 0 && m_Open < before)
        m_Said += "; " + Counted(m_Open, "conflict needs", "conflicts need") + " a choice of its own";
}

void Walk::TakeProposed() {
    if (m_Desk.CountProposed() == 0)
        return Say("Nothing is proposed: these values were never decided before");
    SettleDesk::Step step;
    if (Do([&] { step = m_Desk.TakeProposed(); })) TellStep("Took what was decided before", step);
}

std::vector<const SettleProblem*> Walk::ProblemsInOrder() const {
    std::vector<const SettleProblem*> problems;
    for (const SettleProblem& problem : m_Desk.Problems()) problems.push_back(&problem);
    std::stable_partition(problems.begin(), problems.end(),
                          [](const SettleProblem* problem) { return !problem->remedies.empty(); });
    return problems;
}

void Walk::Mend(std::size_t remedy) {
    for (const SettleProblem* problem : ProblemsInOrder()) {
        if (remedy >= problem->remedies.size()) {
            remedy -= problem->remedies.size();
            continue;
        }
        // The step makes new problems of them.
        const SettleProblem mended = *problem;
        SettleDesk::Step step;
        if (Do([&] { step = m_Desk.Mend(mended, mended.remedies[remedy]); }))
            TellStep("Done: " + mended.remedies[remedy].text, step);
        return;
    }
    Say("Nothing is offered under that number");
}

/// Goes to what is open again.
void Walk::Undo() {
    const auto whatIsAt = [&](const Stop& stop) {
        return std::pair(stop.scene, stop.item ? ItemOf(stop)->about : nullptr);
    };
    std::set<std::pair<std::size_t, const OpenConflict*>> open; // only looked into
    for (const Stop& stop : m_Stops)
        if (IsOpen(stop)) open.insert(whatIsAt(stop));
    bool isDone = false;
    if (!Do([&] { isDone = m_Desk.Undo(); })) return;
    Say(isDone ? "The last step is taken back; r makes it again" : "There is no step to take back");
    const auto reopened = std::ranges::find_if(
        m_Stops, [&](const Stop& stop) { return IsOpen(stop) && !open.contains(whatIsAt(stop)); });
    if (reopened != m_Stops.end()) m_At = static_cast<std::size_t>(reopened - m_Stops.begin());
}

void Walk::Redo() {
    bool isDone = false;
    if (Do([&] { isDone = m_Desk.Redo(); }))
        Say(isDone ? "The step is made again" : "No step was taken back");
}

std::optional<Walk::Finished> Walk::Finish(bool overwrite) {
    Finished finished;
    if (!Do([&] { finished.paths = m_Desk.Finish(overwrite, finished.refused); })) return {};
    finished.changedByHand = m_Desk.ChangedByHand();
    return finished;
}

} // namespace ovrin
