#include "Review/ReviewPage.h"

#include "Names/PrintableText.h"
#include "Words/Failure.h"

#include <algorithm>
#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

namespace {

constexpr std::size_t kMostItems = 1000;

/// A scene that can't be read.
constexpr const char* kNothing =
    R"({"tree":[],"objects":{},"map":{"bounds":null,"unplaced":0,"items":[],"bundles":[]}})";

/// Appends what is between the brackets of an array to what is to be one.
void AppendItems(std::string& all, const std::string& array) {
    if (array.size() <= 2) return;
    if (!all.empty()) all += ',';
    all.append(array, 1, array.size() - 2);
}

} // namespace

ReviewPage::ReviewPage(ReviewSources sources, SceneRules rules, const Progress& progress)
    : m_Sources(std::move(sources)), m_Rules(std::move(rules)), m_Processes(m_Sources, m_Rules) {
    std::vector<json> looks(m_Sources.files.size());
    m_Processes.Look(progress, [&](std::size_t file, json look) { looks[file] = std::move(look); });
    for (std::size_t file = 0; file < looks.size(); ++file)
        if (!looks[file].is_null()) TakeLook(file, looks[file]);
}

void ReviewPage::TakeLook(std::size_t file, const json& look) {
    Scene scene;
    scene.file = file;
    scene.known = {m_Scenes.size(), m_Open, look.value("open", std::size_t{0})};
    scene.counts = look.contains("counts") ? look["counts"].dump() : "null";
    scene.problem = look.value("problem", "");
    m_Open += scene.known.open;
    m_Scenes.push_back(std::move(scene));
}

std::vector<std::string> ReviewPage::Problems() const {
    std::vector<std::string> problems;
    for (const Scene& scene : m_Scenes)
        if (!scene.problem.empty())
            problems.push_back(Printable(m_Sources.files[scene.file].path) + ": " + scene.problem);
    return problems;
}

json ReviewPage::SceneJson(const Scene& scene) const {
    const ReviewSource& source = m_Sources.files[scene.file];
    const SideLabels& labels = source.labels;
    return {{"path", Printable(source.path)},
            {"action", m_Sources.isMerge ? "merge" : ""},
            {"labels",
             {{"base", Printable(labels.base)},
              {"ours", Printable(labels.ours)},
              {"theirs", Printable(labels.theirs)}}},
            {"sides", m_Sources.sides},
            {"bothAdded", false},
            {"open", scene.known.open},
            {"settled", 0},
            {"counts", json::parse(scene.counts)},
            {"problem", scene.problem.empty() ? json() : json(scene.problem)}};
}

json ReviewPage::Session() const {
    json scenes = json::array();
    for (const Scene& scene : m_Scenes) scenes.push_back(SceneJson(scene));
    const json versions =
        m_Sources.isMerge ? json{"base", "ours", "theirs"} : json::array({"before", "after"});
    return {{"mode", "review"},
            {"versions", versions},
            {"scenes", std::move(scenes)},
            {"open", m_Open},
            {"total", m_Open},
            {"proposed", 0},
            {"canUndo", false},
            {"canRedo", false},
            {"isSettled", m_Open == 0},
            {"problems", json::array()},
            {"revision", 0}};
}

PageAnswer ReviewPage::Answer(const PageRequest& request) {
    if (request.method != "GET")
        return PageError(405, "A review decides nothing: \"ovrin settle --web\" does");
    try {
        if (request.path == "api/session") return JsonAnswer(Session());
        if (request.path == "api/conflicts") return AnswerItems(request);
        return AnswerOfScene(request);
    } catch (const Failure& failure) {
        return PageError(400, failure.what());
    }
}

PageAnswer ReviewPage::AnswerOfScene(const PageRequest& request) {
    const std::size_t scene = QueryNumber(request, "scene", 0, m_Scenes.size());
    if (scene == m_Scenes.size()) return PageError(404, "The review has no such scene");
    return Ask(m_Scenes[scene], request);
}

/// The items of one scene after the other.
PageAnswer ReviewPage::AnswerItems(const PageRequest& request) {
    std::size_t from = QueryNumber(request, "from", 0, m_Open);
    const std::size_t end = std::min(m_Open, from + QueryNumber(request, "count", 200, kMostItems));
    std::string items;
    for (const Scene& scene : m_Scenes) {
        const std::size_t behind = scene.known.firstItem + scene.known.open;
        if (behind <= from || from >= end) continue;
        const std::size_t count = std::min(end, behind) - from;
        PageAnswer answer =
            Ask(scene,
                {"GET",
                 request.path,
                 {{"from", std::to_string(from - scene.known.firstItem)}, {"count", std::to_string(count)}},
                 ""});
        if (answer.status != 200) return answer;
        AppendItems(items, answer.body);
        from += count;
    }
    return {200, "application/json",
            R"({"total":)" + std::to_string(m_Open) + R"(,"items":[)" + items + "]}"};
}

PageAnswer ReviewPage::Ask(const Scene& scene, const PageRequest& request) {
    return m_Processes.Ask(scene.file, request, scene.known);
}

std::string ReviewPage::Whole(const Progress& progress, std::size_t& leftOut) {
    std::vector<ReviewScenes::Wanted> wanted;
    for (const Scene& scene : m_Scenes)
        if (scene.problem.empty()) wanted.push_back({scene.file, scene.known});
    std::vector<SceneAnswers::Whole> wholes(m_Scenes.size());
    leftOut = 0;
    m_Processes.All(wanted, progress, [&](std::size_t index, SceneAnswers::Whole whole) {
        leftOut += whole.leftOut;
        wholes[wanted[index].known.scene] = std::move(whole);
    });
    std::string conflicts, scenes;
    for (const SceneAnswers::Whole& whole : wholes) {
        AppendItems(conflicts, whole.items);
        scenes += (scenes.empty() ? "" : ",") + (whole.views.empty() ? kNothing : whole.views);
    }
    return R"({"session":)" + JsonText(Session()) + R"(,"conflicts":[)" + conflicts + R"(],"scenes":[)" +
           scenes + "]}";
}

} // namespace ovrin
