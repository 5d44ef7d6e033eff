#include "Doctor/Patient.h"

#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"
#include "Systems/Git.h"
#include "Systems/Process.h"

#include "Descriptor.h"

#include <algorithm>
#include <fcntl.h>
#include <string_view>
#include <unistd.h>

namespace ovrin {

namespace {

/// Enough for the header of a scene, and for all of a pointer.
std::string StartOf(const std::string& path) {
    const Descriptor file = OpenFile(path.c_str(), O_RDONLY | O_NONBLOCK);
    char bytes[1024];
    const ssize_t count =
        file.IsOpen() ? Uninterrupted([&] { return read(file.Get(), bytes, sizeof(bytes)); }) : 0;
    return count > 0 ? std::string(bytes, static_cast<std::size_t>(count)) : std::string();
}

/// Those of version control's list, whose names are of bytes.
std::vector<std::string> ScenesAmong(std::string_view listed) {
    std::vector<std::string> scenes = ZeroEndedTexts(listed);
    std::erase_if(scenes, [](const std::string& path) { return !IsSceneName(path); });
    scenes.erase(std::unique(scenes.begin(), scenes.end()), scenes.end()); // an unmerged one is listed thrice
    return scenes;
}

/// Subversion lists no names that can be told apart for sure, so its files are looked for.
std::string FilesBelow(const std::string& folder) {
    return OutputOf({"find", ".", "-name", ".svn", "-prune", "-o", "-type", "f", "-printf", "%P\\0"},
                    {.folder = folder});
}

} // namespace

std::vector<std::string> Patient::ListScenes() const {
    if (!m_Repository || m_Repository->top.empty()) return {};
    switch (m_Repository->kind) {
    case SystemKind::Git:
        return ScenesAmong(Git(*m_Repository).Output({"ls-files", "-z"}));
    case SystemKind::Mercurial:
        return ScenesAmong(AnswerOf({"hg", "files", "-0"}, {.folder = m_Repository->top}));
    case SystemKind::Subversion:
        return ScenesAmong(FilesBelow(m_Repository->top));
    }
    return {};
}

void Patient::AskForAttributes(std::vector<SceneLook>& scenes) const {
    std::string paths;
    for (const SceneLook& scene : scenes) (paths += scene.path) += '\0';
    const std::vector<std::string> answers = ZeroEndedTexts(
        Git(*m_Repository)
            .Output({"check-attr", "-z", "--stdin", "merge", "text", "eol", "filter"}, std::move(paths)));
    std::size_t scene = 0; // answers come in the order of the questions: path, attribute, value
    for (std::size_t i = 0; i + 2 < answers.size() && scene < scenes.size(); i += 3) {
        while (scene + 1 < scenes.size() && scenes[scene].path != answers[i]) ++scene;
        scenes[scene].attributes[answers[i + 1]] = answers[i + 2];
    }
}

const std::vector<SceneLook>& Patient::Scenes() {
    if (m_Scenes) return *m_Scenes;
    std::vector<SceneLook> scenes;
    for (std::string& path : ListScenes()) {
        std::string start = StartOf(m_Repository->top + '/' + path);
        scenes.push_back({std::move(path), std::move(start), {}});
    }
    if (IsIn(SystemKind::Git)) AskForAttributes(scenes);
    return m_Scenes.emplace(std::move(scenes));
}

std::map<std::string, std::string> Patient::AttributesOf(const std::string& path) const {
    std::vector<SceneLook> looks = {{path, {}, {}}};
    AskForAttributes(looks);
    return looks.front().attributes;
}

std::string NameScenes(const std::vector<const SceneLook*>& scenes) {
    if (scenes.empty()) return "no scene";
    const std::string first = Printable(scenes.front()->path);
    return scenes.size() == 1 ? first : std::to_string(scenes.size()) + " scenes, the first " + first;
}

} // namespace ovrin
