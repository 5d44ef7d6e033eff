#include "Settle/Web/DeskViews.h"

#include "Review/ViewRequests.h"
#include "Settle/MergedScene.h"
#include "Settle/SettleSession.h"
#include "Values/YAMLScalar.h"
#include "Words/Failure.h"

#include <algorithm>
#include <array>
#include <limits>
#include <nlohmann/json.hpp>
#include <string_view>

namespace ovrin {

using nlohmann::json;

namespace {

std::vector<ConflictMark> MarksOf(const SettleDesk& desk, std::size_t scene) {
    std::vector<ConflictMark> marks;
    for (std::size_t i = 0; i < desk.Items().size(); ++i) {
        const SettleDesk::Item& item = desk.Items()[i];
        if (item.scene == scene) marks.push_back({item.about, i, item.isOpen, item.decided, item.proposed});
    }
    return marks;
}

} // namespace

SceneView& DeskViews::View(std::size_t scene) {
    Shown& shown = m_Views[scene];
    SettleSession& session = *m_Desk.Scenes()[scene];
    if (!shown.view) shown.view = std::make_unique<SceneView>(session.Merge(), session.Names());
    if (shown.revision != m_Revision) {
        shown.view->SetConflicts(MarksOf(m_Desk, scene));
        shown.merged.reset();
    }
    shown.revision = m_Revision;
    return *shown.view;
}

json DeskViews::Counts(std::size_t scene) {
    return View(scene).Counts();
}

/// Merges by the decisions in a process of its own, the first time that it is asked since they were made.
PageAnswer DeskViews::AnswerMerged(std::size_t scene, const PageRequest& request) {
    SceneView& view = View(scene);
    std::unique_ptr<SceneProcess>& process = m_Views[scene].merged;
    if (!process)
        process = std::make_unique<SceneProcess>([&] {
            SettleSession& session = *m_Desk.Scenes()[scene];
            MergeHere(session.Merge(), session.Decisions(), session.Source().take);
            return [&view](const PageRequest& asked) { return AnswerView(view, asked).value(); };
        });
    try {
        return process->Ask(request);
    } catch (const Failure&) {
        process.reset();
        throw;
    }
}

std::optional<PageAnswer> DeskViews::Answer(const PageRequest& request) {
    constexpr std::array<std::string_view, 4> kKnown = {"api/tree", "api/find", "api/object", "api/map"};
    if (std::ranges::find(kKnown, request.path) == kKnown.end()) return {};
    const std::size_t scene = QueryNumber(request, "scene", 0, std::numeric_limits<std::size_t>::max());
    if (scene >= m_Views.size()) throw Failure("There is no such scene");
    // Only the values of an object come from the result.
    const auto* object = ovrin_yaml::YAMLScalar::Lookup(QueryText(request, "id"));
    if (request.path == "api/object" && !m_Desk.Scenes()[scene]->IsAsMerged(object))
        return AnswerMerged(scene, request);
    return AnswerView(View(scene), request);
}

} // namespace ovrin
