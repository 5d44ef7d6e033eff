#pragma once

#include "Systems/Repository.h"

#include <map>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

/// What one check says of many scenes at once needs them listed and looked at once only.
struct SceneLook {
    std::string path;  ///< from the top of the working tree
    std::string start; ///< the first bytes; empty for a scene that isn't there
    /// What git's attributes say: "merge", "text", "eol", "filter". Empty outside of git.
    std::map<std::string, std::string> attributes;
};

/// What the checks look at: the repository around the present folder, if there is one, and the scenes that
/// its version control knows. Everything is asked for when it is first wanted; Forget forgets the answers.
class Patient {
public:
    Patient() : m_Repository(FindRepository()) {}

    const std::optional<Repository>& Around() const { return m_Repository; }
    bool IsIn(SystemKind kind) const { return m_Repository && m_Repository->kind == kind; }
    /// The scenes of the working tree. Throws Failure if version control can't list them.
    const std::vector<SceneLook>& Scenes();
    /// What git says of a name, such as "a.ovrin", which needn't be there.
    std::map<std::string, std::string> AttributesOf(const std::string& path) const;
    void Forget() { m_Scenes.reset(); }

private:
    std::vector<std::string> ListScenes() const;
    void AskForAttributes(std::vector<SceneLook>& scenes) const;

    const std::optional<Repository> m_Repository;
    std::optional<std::vector<SceneLook>> m_Scenes;
};

/// "Levels/a.ovrin" for one, "12 scenes, the first Levels/a.ovrin" for more.
std::string NameScenes(const std::vector<const SceneLook*>& scenes);

} // namespace ovrin
