#include "Review/ReviewScenes.h"

#include "Names/PrintableText.h"
#include "Systems/WorkerProcesses.h"
#include "Words/Failure.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <thread>

namespace ovrin {

using nlohmann::json;

namespace {

// What a process is asked besides requests of pages, in the place of their methods.
constexpr const char *kLook = "LOOK", *kAll = "ALL";

/// In a form that keeps any bytes.
std::string Packed(const json& value) {
    std::string bytes;
    json::to_cbor(value, bytes);
    return bytes;
}

json PackedKnown(const SceneAnswers::Known& known) {
    return {known.scene, known.firstItem, known.open};
}

SceneAnswers::Known KnownOf(const json& packed) {
    return {packed[0], packed[1], packed[2]};
}

/// [items, views, left out], or why there are none.
std::string PackedWhole(SceneAnswers& answers, const SceneAnswers::Known& known) {
    try {
        const SceneAnswers::Whole whole = answers.All(known);
        return Packed(json::array({whole.items, whole.views, whole.leftOut}));
    } catch (const Failure& failure) {
        return Packed(failure.what());
    }
}

SceneAnswers::Whole WholeOf(const std::string& packed) {
    const json whole = json::from_cbor(packed);
    if (whole.is_string()) throw Failure(std::string(whole));
    return {whole[0], whole[1], whole[2]};
}

/// There, for what is asked here. The body says what is known of the scene.
PageAnswer AnswerThere(SceneAnswers& answers, const PageRequest& request) {
    if (request.method == kLook) return {200, "", Packed(answers.Look())};
    const SceneAnswers::Known known = KnownOf(json::from_cbor(request.body));
    if (request.method == kAll) return {200, "", PackedWhole(answers, known)};
    return answers.Answer(request, known);
}

std::string EndOf(const WorkerAnswer& answer) {
    return "It can't be looked into: the process for it was " + answer.end;
}

/// The work on each of `count` files, a process each.
void WorkOnEach(std::size_t count, const ReviewScenes::Progress& progress,
                const std::function<std::string(std::size_t)>& work,
                const std::function<void(std::size_t, WorkerAnswer)>& take) {
    const std::vector<std::uint64_t> sizes(count, 1);
    const std::size_t processes = std::max(1U, std::thread::hardware_concurrency());
    std::size_t done = 0;
    WorkInProcesses(sizes, {processes, 1, processes}, work, [&](std::size_t piece, WorkerAnswer answer) {
        take(piece, std::move(answer));
        progress(++done, count);
    });
}

} // namespace

ReviewScenes::ReviewScenes(const ReviewSources& sources, const SceneRules& rules)
    : m_Sources(sources), m_Rules(rules) {}

std::unique_ptr<SceneAnswers> ReviewScenes::Open(std::size_t file) const {
    return std::make_unique<SceneAnswers>(m_Sources.files[file], m_Rules, m_Sources.isMerge);
}

void ReviewScenes::Look(const Progress& progress, const Take<json>& take) {
    const std::size_t count = m_Sources.files.size();
    if (!AreAllAtHand()) {
        WorkOnEach(
            count, progress, [&](std::size_t file) { return Packed(Open(file)->Look()); },
            [&](std::size_t file, WorkerAnswer answer) {
                take(file, answer.text ? json::from_cbor(*answer.text) : json{{"problem", EndOf(answer)}});
            });
        return;
    }
    // All begin to read at once.
    for (std::size_t file = 0; file < count; ++file) Hold(file);
    for (std::size_t file = 0; file < count; ++file) {
        try {
            take(file, json::from_cbor(AskProcess(file, {kLook, "", {}, ""}).body));
        } catch (const Failure& failure) {
            take(file, {{"problem", failure.what()}});
        }
        progress(file + 1, count);
    }
}

PageAnswer ReviewScenes::Ask(std::size_t file, PageRequest request, const SceneAnswers::Known& known) {
    request.body = Packed(PackedKnown(known));
    return AskProcess(file, request);
}

void ReviewScenes::All(const std::vector<Wanted>& wanted, const Progress& progress,
                       const Take<SceneAnswers::Whole>& take) {
    const auto pathOf = [&](std::size_t index) {
        return Printable(m_Sources.files[wanted[index].file].path);
    };
    const auto takePacked = [&](std::size_t index, const std::string& packed) {
        try {
            take(index, WholeOf(packed));
        } catch (const Failure& failure) {
            throw Failure(pathOf(index) + ": " + failure.what());
        }
    };
    if (AreAllAtHand()) {
        for (std::size_t i = 0; i < wanted.size(); ++i)
            takePacked(i, Ask(wanted[i].file, {kAll, "", {}, ""}, wanted[i].known).body);
        return;
    }
    WorkOnEach(
        wanted.size(), progress,
        [&](std::size_t index) { return PackedWhole(*Open(wanted[index].file), wanted[index].known); },
        [&](std::size_t index, const WorkerAnswer& answer) {
            if (!answer.text) throw Failure(pathOf(index) + ": " + EndOf(answer));
            takePacked(index, *answer.text);
        });
}

SceneProcess& ReviewScenes::Hold(std::size_t file) {
    const auto held = std::ranges::find(m_Held, file, &Held::file);
    if (held != m_Held.end()) {
        m_Held.splice(m_Held.begin(), m_Held, held);
        return *held->process;
    }
    if (m_Held.size() == kMostHeld) m_Held.pop_back();
    const auto open = [this, file] {
        return [answers = std::shared_ptr<SceneAnswers>(Open(file))](const PageRequest& request) {
            return AnswerThere(*answers, request);
        };
    };
    m_Held.push_front({file, std::make_unique<SceneProcess>(open)});
    return *m_Held.front().process;
}

PageAnswer ReviewScenes::AskProcess(std::size_t file, const PageRequest& request) {
    SceneProcess& process = Hold(file);
    try {
        return process.Ask(request);
    } catch (const Failure&) {
        m_Held.pop_front(); // the next question starts another one
        throw;
    }
}

} // namespace ovrin
