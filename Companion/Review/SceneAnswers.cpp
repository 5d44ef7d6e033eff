#include "Review/SceneAnswers.h"

#include "Review/ReviewedScene.h"
#include "Review/ViewRequests.h"
#include "Words/Failure.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

SceneAnswers::SceneAnswers(const ReviewSource& source, const SceneRules& rules, bool isMerge) {
    try {
        if (std::optional<ThreeTexts> texts = source.read())
            m_Scene = std::make_unique<ReviewedScene>(std::move(*texts), rules, isMerge);
    } catch (const Failure& failure) {
        m_Problem = failure.what();
    }
}

SceneAnswers::~SceneAnswers() = default;

json SceneAnswers::Look() const {
    if (!m_Problem.empty()) return {{"problem", m_Problem}};
    if (!m_Scene) return nullptr;
    return {{"counts", m_Scene->View().Counts()}, {"open", m_Scene->CountOpen()}};
}

void SceneAnswers::Check(const Known& known) const {
    if (!m_Problem.empty()) throw Failure(m_Problem);
    if (!m_Scene || m_Scene->CountOpen() != known.open)
        throw Failure("The scene was changed since the review began: begin it again");
}

PageAnswer SceneAnswers::Answer(const PageRequest& request, const Known& known) {
    try {
        Check(known);
    } catch (const Failure& failure) {
        return PageError(409, failure.what());
    }
    m_Scene->NumberFrom(known.firstItem);
    if (request.path == "api/conflicts")
        return JsonAnswer(
            m_Scene->Items(known.scene, {QueryNumber(request, "from", 0, known.open),
                                         QueryNumber(request, "count", known.open, known.open)}));
    return AnswerView(m_Scene->View(), request).value_or(PageError(404, "There is no such thing"));
}

SceneAnswers::Whole SceneAnswers::All(const Known& known) {
    Check(known);
    m_Scene->NumberFrom(known.firstItem);
    ReviewedScene::WholeText views = m_Scene->Whole();
    return {JsonText(m_Scene->Items(known.scene, {0, known.open})), std::move(views.text), views.leftOut};
}

} // namespace ovrin
