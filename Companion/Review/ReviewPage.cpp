#include "Review/ReviewPage.h"

#include "Names/PrintableText.h"
#include "Review/ReviewedScene.h"
#include "Review/ViewRequests.h"
#include "Systems/WorkerProcesses.h"
#include "Words/Failure.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <thread>

namespace ovrin {

using nlohmann::json;

namespace {

constexpr std::size_t kMostHeld = 3, kMostItems = 1000;

/// A scene that can't be read.
constexpr const char* kNothing =
    R"({"tree":[],"objects":{},"map":{"bounds":null,"unplaced":0,"items":[],"bundles":[]}})";

std::string Text(const json& value) {
    return value.dump(-1, ' ', false, json::error_handler_t::replace);
}

/// The work on each of `count` scenes, a process each.
void WorkOnEach(std::size_t count, const ReviewPage::Progress& progress,
                const std::function<std::string(std::size_t)>& work,
                const std::function<void(std::size_t, WorkerAnswer)>& take) {
    const std::vector<std::uint64_t> sizes(count, 1);
    const std::size_t processes = std::max(1U, std::thread::hardware_concurrency());
    std::size_t done = 0;
    progress(done, count);
    WorkInProcesses(sizes, {processes, 1, processes}, work, [&](std::size_t piece, WorkerAnswer answer) {
        take(piece, std::move(answer));
        progress(++done, count);
    });
}

std::string EndOf(const WorkerAnswer& answer) {
    return "It can't be looked into: the process for it was " + answer.end;
}

} // namespace

ReviewPage::ReviewPage(ReviewSources sources, SceneRules rules, const Progress& progress)
    : m_Sources(std::move(sources)), m_Rules(std::move(rules)) {
    Look(progress);
}

void ReviewPage::Look(const Progress& progress) {
    std::vector<json> looks(m_Sources.files.size());
    WorkOnEach(
        looks.size(), progress, [&](std::size_t source) { return LookAt(source); },
        [&](std::size_t source, WorkerAnswer answer) {
            looks[source] = answer.text ? json::parse(*answer.text) : json{{"problem", EndOf(answer)}};
        });
    for (std::size_t source = 0; source < looks.size(); ++source) {
        const json& look = looks[source];
        if (look.is_null()) continue;
        Scene scene;
        scene.source = source;
        scene.firstItem = m_Open;
        scene.open = look.value("open", std::size_t{0});
        scene.counts = look.contains("counts") ? look["counts"].dump() : "null";
        scene.problem = look.value("problem", "");
        m_Open += scene.open;
        m_Scenes.push_back(std::move(scene));
    }
}

/// null for what is no scene, {"counts", "open"}, or {"problem"}.
std::string ReviewPage::LookAt(std::size_t source) const {
    try {
        std::optional<ThreeTexts> texts = m_Sources.files[source].read();
        if (!texts) return "null";
        ReviewedScene scene(std::move(*texts), m_Rules, m_Sources.isMerge, 0);
        return Text({{"counts", scene.View().Counts()}, {"open", scene.CountOpen()}});
    } catch (const Failure& failure) {
        return Text({{"problem", failure.what()}});
    }
}

std::vector<std::string> ReviewPage::Problems() const {
    std::vector<std::string> problems;
    for (const Scene& scene : m_Scenes)
        if (!scene.problem.empty())
            problems.push_back(Printable(m_Sources.files[scene.source].path) + ": " + scene.problem);
    return problems;
}

json ReviewPage::SceneJson(const Scene& scene) const {
    const ReviewSource& source = m_Sources.files[scene.source];
    const SideLabels& labels = source.labels;
    return {{"path", Printable(source.path)},
            {"action", m_Sources.isMerge ? "merge" : ""},
            {"labels",
             {{"base", Printable(labels.base)},
              {"ours", Printable(labels.ours)},
              {"theirs", Printable(labels.theirs)}}},
            {"sides", m_Sources.sides},
            {"bothAdded", false},
            {"open", scene.open},
            {"settled", 0},
            {"counts", json::parse(scene.counts)},
            {"problem", scene.problem.empty() ? json() : json(scene.problem)}};
}

json ReviewPage::Session() const {
    json scenes = json::array();
    for (const Scene& scene : m_Scenes) scenes.push_back(SceneJson(scene));
    const json versions = m_Sources.isMerge ? json{"base", "ours", "theirs"} : json{"before", "after"};
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

/// A file of the working tree may have changed since.
std::unique_ptr<ReviewedScene> ReviewPage::Open(const Scene& scene) const {
    if (!scene.problem.empty()) throw Failure(scene.problem);
    std::optional<ThreeTexts> texts = m_Sources.files[scene.source].read();
    auto opened = texts ? std::make_unique<ReviewedScene>(std::move(*texts), m_Rules, m_Sources.isMerge,
                                                          scene.firstItem)
                        : nullptr;
    if (!opened || opened->CountOpen() != scene.open)
        throw Failure("The scene was changed since the review began: begin it again");
    return opened;
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
    return Ask(scene, request);
}

/// The items of one scene after the other.
PageAnswer ReviewPage::AnswerItems(const PageRequest& request) {
    std::size_t from = QueryNumber(request, "from", 0, m_Open);
    const std::size_t end = std::min(m_Open, from + QueryNumber(request, "count", 200, kMostItems));
    json items = json::array();
    for (std::size_t i = 0; i < m_Scenes.size() && from < end; ++i) {
        const Scene& scene = m_Scenes[i];
        if (scene.firstItem + scene.open <= from) continue;
        const std::size_t count = std::min(end, scene.firstItem + scene.open) - from;
        const PageAnswer answer =
            Ask(i, {"GET",
                    request.path,
                    {{"from", std::to_string(from - scene.firstItem)}, {"count", std::to_string(count)}},
                    ""});
        if (answer.status != 200) return answer;
        for (json& item : json::parse(answer.body)) items.push_back(std::move(item));
        from += count;
    }
    return JsonAnswer({{"total", m_Open}, {"items", std::move(items)}});
}

PageAnswer ReviewPage::Ask(std::size_t scene, const PageRequest& request) {
    auto held = std::ranges::find(m_Held, scene, &Held::scene);
    if (held != m_Held.end()) {
        m_Held.splice(m_Held.begin(), m_Held, held);
    } else {
        if (m_Held.size() == kMostHeld) m_Held.pop_back();
        const auto open = [this, scene] {
            const std::shared_ptr<ReviewedScene> opened = Open(m_Scenes[scene]);
            return [opened, scene](const PageRequest& asked) -> PageAnswer {
                if (asked.path == "api/conflicts")
                    return JsonAnswer(opened->Items(scene, {QueryNumber(asked, "from", 0, kMostItems),
                                                            QueryNumber(asked, "count", 0, kMostItems)}));
                return AnswerView(opened->View(), asked).value_or(PageError(404, "There is no such thing"));
            };
        };
        m_Held.emplace_front(Held{scene, std::make_unique<SceneProcess>(open)});
    }
    try {
        return m_Held.front().process->Ask(request);
    } catch (const Failure&) {
        m_Held.pop_front();
        throw;
    }
}

/// [items, whole, problem] in a form that leaves texts of JSON as they are; the problem is empty where there
/// is none.
std::string ReviewPage::WholeOf(std::size_t index) const {
    const Scene& scene = m_Scenes[index];
    std::string items, whole, problem, bytes;
    try {
        const std::unique_ptr<ReviewedScene> opened = Open(scene);
        items = Text(opened->Items(index, {0, scene.open}));
        whole = Text(opened->Whole());
    } catch (const Failure& failure) {
        problem = failure.what();
    }
    json::to_cbor(json::array({items, whole, problem}), bytes);
    return bytes;
}

std::string ReviewPage::Whole(const Progress& progress) const {
    struct Texts {
        std::string items, whole;
    };
    std::vector<Texts> scenes(m_Scenes.size());
    const auto take = [&](std::size_t index, WorkerAnswer answer) {
        const Scene& scene = m_Scenes[index];
        if (!scene.problem.empty()) return;
        const std::string path = Printable(m_Sources.files[scene.source].path);
        if (!answer.text) throw Failure(path + ": " + EndOf(answer));
        const json read = json::from_cbor(*answer.text);
        if (read[2] != "") throw Failure(path + ": " + std::string(read[2]));
        scenes[index] = {read[0], read[1]};
    };
    WorkOnEach(
        scenes.size(), progress, [&](std::size_t index) { return WholeOf(index); }, take);
    std::string conflicts, wholes;
    for (const Texts& scene : scenes) {
        const std::string items = scene.items.size() > 2 ? scene.items.substr(1, scene.items.size() - 2) : "";
        if (!items.empty()) conflicts += (conflicts.empty() ? "" : ",") + items;
        wholes += (wholes.empty() ? "" : ",") + (scene.whole.empty() ? kNothing : scene.whole);
    }
    return R"({"session":)" + Text(Session()) + R"(,"conflicts":[)" + conflicts + R"(],"scenes":[)" + wholes +
           "]}";
}

} // namespace ovrin
