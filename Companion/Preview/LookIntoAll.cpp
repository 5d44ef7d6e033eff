#include "Preview/LookIntoAll.h"

#include "Preview/Question.h"
#include "Preview/ScenePreview.h"
#include "Systems/BlobReader.h"
#include "Systems/Git.h"
#include "Systems/Memory.h"
#include "Systems/WorkerProcesses.h"
#include "Words/Failure.h"

#include <algorithm>
#include <thread>

namespace ovrin {

namespace {

/// Texts of this many bytes and what the engine makes of them stay in a process until it ends.
constexpr std::uint64_t kMostOfProcess = std::uint64_t{64} << 20;

/// Memory that the merge takes for a byte of the three texts. Measured: 3 where a hundredth of the objects is
/// edited, 4 at half of them, 7 where nearly all are and every second one is a conflict.
constexpr std::uint64_t kMemoryOfByte = 7;

/// Half of the machine is left to others, and to what else git needs.
WorkLimits Limits() {
    return {std::max(1u, std::thread::hardware_concurrency()), kMostOfProcess,
            UsableMemory() / 2 / kMemoryOfByte};
}

/// What the processes do. Each has its own git.
class Looker {
public:
    Looker(const PreviewQuestion& question, const Repository& repository, const SceneRules& rules,
           ovrin_yaml::Threads threads)
        : m_Question(question), m_Rules(rules), m_Threads(threads), m_Git(Git(repository).Setting()) {}

    /// The scene as JSON.
    std::string Look(std::size_t index) {
        PreviewedScene scene = m_Question.answer.scenes[index];
        const UnmergedFile& file = m_Question.files[index];
        try {
            const ThreeTexts texts = {Read(file.base), Read(file.ours), Read(file.theirs)};
            LookInto(scene, texts, m_Question.answer, m_Rules, m_Threads);
        } catch (const Failure& failure) {
            MakeUnknown(scene, failure.what());
        }
        return ToJson(scene).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
    }

private:
    /// An empty blob may be one that only git's merge of several bases knows.
    std::string Read(const std::optional<TreeEntry>& entry) {
        return entry && entry->size ? m_Git.Read(entry->id) : "";
    }

    const PreviewQuestion& m_Question;
    const SceneRules& m_Rules;
    const ovrin_yaml::Threads m_Threads;
    BlobReader m_Git;
};

/// Takes over what a process found out. The path may have bytes that JSON can't hold.
void Learn(PreviewedScene& scene, const std::string& text) {
    std::string path = std::move(scene.path);
    scene = SceneOfJson(nlohmann::json::parse(text));
    scene.path = std::move(path);
}

} // namespace

void LookIntoAll(PreviewQuestion& question, const Repository& repository, const SceneRules& rules,
                 const std::function<void(std::size_t done, std::size_t all)>& watch) {
    std::vector<std::size_t> looked;
    std::vector<std::uint64_t> sizes;
    for (std::size_t i = 0; i < question.files.size(); ++i) {
        if (!IsMerged(question.files[i])) continue;
        looked.push_back(i);
        sizes.push_back(CostOf(question.files[i]));
    }
    const WorkLimits limits = Limits();
    // Fewer scenes than processors: then each may use several.
    Looker looker(question, repository, rules,
                  looked.size() < limits.processes ? ovrin_yaml::Threads::WhereWorthwhile
                                                   : ovrin_yaml::Threads::None);
    std::size_t done = 0;
    const auto take = [&](std::size_t piece, const WorkerAnswer& answer) {
        PreviewedScene& scene = question.answer.scenes[looked[piece]];
        if (answer.text)
            Learn(scene, *answer.text);
        else
            MakeUnknown(scene, "the process that merged it was " + answer.end);
        watch(++done, looked.size());
    };
    WorkInProcesses(
        sizes, limits, [&](std::size_t piece) { return looker.Look(looked[piece]); }, take);
}

} // namespace ovrin
