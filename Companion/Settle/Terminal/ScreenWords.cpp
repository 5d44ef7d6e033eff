#include "Settle/Terminal/ScreenWords.h"

#include "Conflicts/ConflictReport.h"
#include "Names/PrintableText.h"
#include "Settle/Terminal/KeyTable.h"

#include <algorithm>

namespace ovrin {

namespace {

constexpr std::size_t kMostNumbers = 9; // as many as there are keys

std::string Scenes(std::size_t count, const char* one, const char* many) {
    return std::to_string(count) +
           (count == 1 ? std::string(" scene ") + one : std::string(" scenes ") + many);
}

/// How many there are in what would be finished.
std::size_t ProblemsOfSettled(const Walk& walk) {
    const Sessions sessions = walk.Desk().Scenes();
    return static_cast<std::size_t>(
        std::ranges::count_if(walk.Desk().Problems(), [&](const SettleProblem& problem) {
            return sessions[problem.scene]->IsSettled();
        }));
}

} // namespace

std::string CountLine(const Walk& walk) {
    const std::string count =
        std::to_string(walk.CountOpen()) + " of " + std::to_string(walk.Stops().size()) + " open";
    return count + " · " + Printable(walk.SceneOf(walk.Here()).Source().path);
}

std::string SidesLine(const Walk& walk) {
    const Occasion& occasion = walk.SceneOf(walk.Here()).Source().occasion;
    std::string sides;
    for (const Side side : {Side::Ours, Side::Theirs})
        if (const std::string label = SideLabels::Of(occasion).Of(side); !label.empty())
            sides += (sides.empty() ? "" : ", ") + std::string(SideName(side)) + " is " + Printable(label);
    if (occasion.action.empty() || sides.empty()) return occasion.action + sides;
    return occasion.action + ": " + sides;
}

std::vector<StyledLine> ProblemLines(const Walk& walk, const Letters& letters) {
    std::vector<StyledLine> lines;
    std::size_t number = 0;
    for (const SettleProblem* problem : walk.ProblemsInOrder()) {
        const bool isHere = problem->scene == walk.Here().scene;
        const std::string scene = isHere ? "" : walk.Desk().Scenes()[problem->scene]->Source().path + ": ";
        lines.push_back({{" ! ", Style::Warning}, {letters.Shown(scene + problem->text)}});
        for (const SettleProblem::Remedy& remedy : problem->remedies)
            if (number++ < kMostNumbers)
                lines.push_back(
                    {{"   " + std::to_string(number) + " ", Style::Key}, {letters.Shown(remedy.text)}});
    }
    return lines;
}

std::string QuestionForSide(const Walk& walk) {
    std::string question = "Which side for all that is open";
    if (walk.Desk().Scenes().size() > 1) question += ", in all scenes";
    const char* separator = "? ";
    for (const Side side : {Side::Ours, Side::Theirs, Side::Base}) {
        question += separator + std::string(1, LetterOf(side)) + " " + SideName(side);
        separator = ", ";
    }
    return question;
}

std::string NothingToFinish(const Walk& walk) {
    return "No scene is settled yet, " + std::to_string(walk.CountOpen()) +
           " of this list are open: q leaves, and keeps what you decided";
}

bool NeedsQuestion(const Walk& walk) {
    return walk.CountOpen() > 0 || ProblemsOfSettled(walk) > 0;
}

std::string QuestionToFinish(const Walk& walk) {
    const Sessions sessions = walk.Desk().Scenes();
    const auto settled = static_cast<std::size_t>(
        std::ranges::count_if(sessions, [](const auto& session) { return session->IsSettled(); }));
    if (settled == 0) return {};
    std::string question;
    if (const std::size_t problems = ProblemsOfSettled(walk))
        question = std::to_string(problems) + (problems == 1 ? " problem is left in what is settled. "
                                                             : " problems are left in what is settled. ");
    if (settled == sessions.size()) return question + "Finish as it is? y yes, n no";
    return question + Scenes(settled, "is settled", "are settled") + ", " +
           Scenes(sessions.size() - settled, "is not", "are not") +
           ". Finish what is settled, and leave? What you decided of the rest is kept. y yes, n no";
}

std::string QuestionToOverwrite(const Remarks& changedByHand) {
    std::string question;
    for (const std::string& remark : changedByHand) question += remark + ". ";
    return question + "Put the settled scene in place there, too? y yes, n leave the file as it is";
}

std::vector<StyledLine> TooSmall(Extent extent, Extent least) {
    const auto size = [](Extent of) { return std::to_string(of.columns) + " x " + std::to_string(of.rows); };
    const std::string text = "This window has " + size(extent) + " characters, and " + size(least) +
                             " are needed: make it larger, or press q to leave. \"ovrin settle --prompt\" "
                             "goes on without a screen.";
    return Wrapped({{text}}, std::max<std::size_t>(extent.columns, 1));
}

} // namespace ovrin
