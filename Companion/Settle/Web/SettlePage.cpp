#include "Settle/Web/SettlePage.h"

#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Review/ConflictItem.h"
#include "Settle/SceneCount.h"
#include "Settle/SceneWords.h"
#include "Settle/SettleSession.h"
#include "Settle/Web/PageFiles.h"
#include "Settle/Web/PageStep.h"
#include "Words/Failure.h"

#include <algorithm>
#include <array>
#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>
#include <variant>

namespace ovrin {

using nlohmann::json;

namespace {

constexpr std::size_t kMostItems = 1000;

/// Makes one visitor of functions for the kinds of a variant.
template <class... Functions> struct Overloaded : Functions... { using Functions::operator()...; };
template <class... Functions> Overloaded(Functions...) -> Overloaded<Functions...>;

std::vector<std::string> AllPrintable(const std::vector<std::string>& texts) {
    std::vector<std::string> printable;
    printable.reserve(texts.size());
    for (const std::string& text : texts) printable.push_back(Printable(text));
    return printable;
}

json LabelsOf(const Occasion& occasion) {
    return {{"base", Printable(occasion.base)},
            {"ours", Printable(occasion.ours)},
            {"theirs", Printable(occasion.theirs)}};
}

json ProblemsOf(const SettleDesk& desk) {
    json problems = json::array();
    for (const SettleProblem& problem : desk.Problems()) {
        json remedies = json::array();
        for (const SettleProblem::Remedy& remedy : problem.remedies) remedies.push_back(remedy.text);
        problems.push_back({{"scene", problem.scene}, {"text", problem.text}, {"remedies", remedies}});
    }
    return problems;
}

PageAnswer LastAnswer(bool isOver, const json& told) {
    PageAnswer answer = JsonAnswer(told);
    answer.isOver = isOver;
    return answer;
}

} // namespace

SettlePage::SettlePage(SettleScenes& scenes, SettleDesk& desk, std::vector<Unreadable> unreadable)
    : m_Scenes(scenes), m_Desk(desk), m_Views(desk), m_Unreadable(std::move(unreadable)) {}

PageAnswer SettlePage::Answer(const PageRequest& request) {
    constexpr std::array<std::string_view, 5> kSteps = {"api/take", "api/undo", "api/redo", "api/finish",
                                                        "api/leave"};
    const bool isStep = std::ranges::find(kSteps, request.path) != kSteps.end();
    if (isStep != (request.method == "POST"))
        return PageError(405, isStep ? "Steps are made with POST" : "Nothing can be changed there");
    return isStep ? Post(request) : Get(request);
}

PageAnswer SettlePage::Get(const PageRequest& request) {
    if (request.path == "api/session") return JsonAnswer(Session());
    if (request.path == "api/conflicts") return JsonAnswer(Conflicts(request));
    if (std::optional<PageAnswer> answer = m_Views.Answer(request)) return *std::move(answer);
    if (std::optional<PageAnswer> answer = AnswerPageFile(request)) return *std::move(answer);
    return PageError(404, "There is nothing of that name");
}

PageAnswer SettlePage::Post(const PageRequest& request) {
    if (request.path == "api/leave") {
        ReadNothing(request.body);
        return Leave();
    }
    const auto isOld = [&](std::uint64_t revision) { return revision != m_Revision; };
    const PageAnswer old = PageError(409, "Something was decided meanwhile, in another page: look again");
    if (request.path == "api/take") {
        const PageStep step = ReadStep(request.body);
        return isOld(step.revision) ? old : AnswerStep(MakeStep(step));
    }
    if (request.path == "api/finish") {
        const PageFinish finish = ReadFinish(request.body);
        return isOld(finish.revision) ? old : Finish(finish.overwrite);
    }
    return isOld(ReadRevision(request.body)) ? old : GoBack(request.path == "api/redo");
}

json SettlePage::SceneOf(std::size_t scene) {
    const SettleSession& session = *m_Desk.Scenes()[scene];
    const Occasion& occasion = session.Source().occasion;
    const SceneCount count = SceneCount::Of(session);
    return {{"path", Printable(count.path)},   {"action", Printable(occasion.action)},
            {"labels", LabelsOf(occasion)},    {"sides", TellSides(occasion)},
            {"bothAdded", count.isBothAdded},  {"open", count.open},
            {"settled", count.settled},        {"counts", m_Views.Counts(scene)},
            {"isFinished", IsFinished(scene)}, {"problem", nullptr}};
}

json SettlePage::Session() {
    const auto any = [&](const auto& number) {
        return std::ranges::any_of(m_Desk.Scenes(),
                                   [&](const auto& session) { return ((*session).*number)() != 0; });
    };
    json scenes = json::array();
    for (std::size_t scene = 0; scene < m_Desk.Scenes().size(); ++scene) scenes.push_back(SceneOf(scene));
    for (const Unreadable& unreadable : m_Unreadable)
        scenes.push_back({{"path", Printable(unreadable.path)},
                          {"action", ""},
                          {"labels", LabelsOf({})},
                          {"sides", ""},
                          {"bothAdded", false},
                          {"open", 0},
                          {"settled", 0},
                          {"counts", {{"added", 0}, {"removed", 0}, {"changed", 0}, {"moved", 0}}},
                          {"isFinished", false},
                          {"problem", PrintableLines(unreadable.problem)}});
    return {{"mode", "settle"},
            {"versions", {"base", "ours", "theirs"}},
            {"scenes", scenes},
            {"open", m_Desk.CountOpen()},
            {"total", m_Desk.Items().size()},
            {"proposed", m_Desk.CountProposed()},
            {"canUndo", m_Finished.empty() && any(&SettleSession::LastStep)},
            {"canRedo", m_Finished.empty() && any(&SettleSession::NextUndone)},
            {"isSettled", m_Desk.IsSettled()},
            {"problems", ProblemsOf(m_Desk)},
            {"revision", m_Revision}};
}

json SettlePage::Conflicts(const PageRequest& request) const {
    const std::size_t total = m_Desk.Items().size();
    const std::size_t from = QueryNumber(request, "from", 0, total);
    const std::size_t end = from + std::min(QueryNumber(request, "count", 200, kMostItems), total - from);
    json items = json::array();
    for (std::size_t i = from; i < end; ++i) {
        const SettleDesk::Item& item = m_Desk.Items()[i];
        items.push_back(
            ConflictItem(m_Desk.Describe(item), {i, item.scene, item.isOpen, item.decided, item.proposed}));
    }
    return {{"total", total}, {"items", items}};
}

PageAnswer SettlePage::AnswerStep(const SettleDesk::Step& step) {
    ++m_Revision;
    m_Views.Renew();
    return JsonAnswer({{"settled", step.settled}, {"followed", step.followed}, {"session", Session()}});
}

std::size_t SettlePage::SceneOfItem(std::size_t item) const {
    if (item >= m_Desk.Items().size()) throw Failure("There is no such conflict");
    return m_Desk.Items()[item].scene;
}

bool SettlePage::IsFinished(std::size_t scene) const {
    return std::ranges::find(m_Finished, m_Desk.Scenes()[scene]->Source().path) != m_Finished.end();
}

void SettlePage::WantUnfinished(std::size_t scene) const {
    if (IsFinished(scene))
        throw Failure(Printable(m_Desk.Scenes()[scene]->Source().path) +
                      " is finished: its file is written, and nothing is decided there any more");
}

SettleDesk::Step SettlePage::MakeStep(const PageStep& step) {
    const auto take = Overloaded{[&](const TakeItem& wish) {
                                     WantUnfinished(SceneOfItem(wish.item));
                                     return m_Desk.Take(wish.item, wish.side);
                                 },
                                 [&](const TakeBelow& wish) {
                                     WantUnfinished(SceneOfItem(wish.under));
                                     return m_Desk.TakeUnder(wish.under, wish.side);
                                 },
                                 [&](const TakeRest& wish) { return m_Desk.TakeAll(wish.side); },
                                 [&](const TakeProposals&) { return m_Desk.TakeProposed(); },
                                 [&](const TakeRemedy& wish) {
                                     if (wish.problem >= m_Desk.Problems().size())
                                         throw Failure("There is no such problem");
                                     const SettleProblem problem =
                                         m_Desk.Problems()[wish.problem]; // a step makes the list anew
                                     if (wish.remedy >= problem.remedies.size())
                                         throw Failure("There is no such remedy");
                                     WantUnfinished(problem.scene);
                                     return m_Desk.Mend(problem, problem.remedies[wish.remedy]);
                                 }};
    return std::visit(take, step.step);
}

PageAnswer SettlePage::GoBack(bool isRedo) {
    if (!m_Finished.empty()) throw Failure("A scene is finished: what led there isn't taken back any more");
    if (!(isRedo ? m_Desk.Redo() : m_Desk.Undo()))
        throw Failure(isRedo ? "There is no decision to make again" : "There is no decision to take back");
    return AnswerStep({});
}

std::vector<std::string> SettlePage::Next() const {
    return NextSteps(m_Scenes.Where(), m_Desk.Scenes().front()->Source().occasion.action);
}

void SettlePage::TellNoneIsReady() const {
    if (m_Desk.CountOpen() > 0)
        throw Failure((m_Finished.empty() ? "No scene is settled yet: " : "No other scene is settled yet: ") +
                      CountOpen(m_Desk.CountOpen()) + " left");
    throw Failure(m_Desk.IsSettled() ? "All that is settled is written"
                                     : "Look through what both sides added, and take it first");
}

/// Puts the results of settled scenes in their places.
PageAnswer SettlePage::Finish(bool overwrite) {
    bool isAnyReady = false;
    for (std::size_t scene = 0; scene < m_Desk.Scenes().size(); ++scene)
        isAnyReady = isAnyReady || (m_Desk.Scenes()[scene]->IsSettled() && !IsFinished(scene));
    if (!isAnyReady) TellNoneIsReady();
    Remarks remarks;
    const std::vector<std::string> finished = m_Desk.Finish(overwrite, remarks);
    m_Finished.insert(m_Finished.end(), finished.begin(), finished.end());
    ++m_Revision;
    const bool isOver = m_Finished.size() == m_Desk.Scenes().size();
    return LastAnswer(isOver, {{"finished", AllPrintable(finished)},
                               {"remarks", remarks},
                               {"changedByHand", m_Desk.ChangedByHand().size()},
                               {"next", isOver ? Next() : std::vector<std::string>()},
                               {"isOver", isOver}});
}

PageAnswer SettlePage::Leave() {
    const json next = json::array({"\"ovrin settle\" goes on where you were, in the terminal; \"ovrin settle "
                                   "--web\" does so here."});
    return LastAnswer(true, {{"next", next}});
}

} // namespace ovrin
