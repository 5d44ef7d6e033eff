#include "Changes/ScenePair.h"

#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"

#include "Reading/DocumentCut.h"

#include <optional>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

/// A scene without objects, with the header of the version that is there.
std::string EmptyScene(const std::string& other) {
    return std::string(FileHeaderOf(other));
}

/// Why a version is no scene; empty if it is one, or isn't there.
std::string ReasonAgainst(const std::string& path, const std::optional<std::string>& text) {
    if (!text) return {};
    const SceneKind kind = ClassifyScene(*text);
    return kind == SceneKind::Scene ? "" : TellKind(Printable(path), kind);
}

} // namespace

ScenePair ReadScenePair(const ChangedFile& changed) {
    const FilePair& file = changed.file;
    ScenePair pair;
    const bool hasBoth = changed.before && changed.after;
    if (!hasBoth && file.status != FileStatus::Added && file.status != FileStatus::Removed) return pair;
    bool isMeant = IsSceneName(file.newPath);
    const IsWanted isWanted = [&isMeant](std::string_view beginning) {
        isMeant = isMeant || HasSignature(beginning);
        return isMeant;
    };
    const auto read = [&](const FileVersion& version) { return version ? version(isWanted) : std::nullopt; };
    std::optional<std::string> after = read(changed.after);
    std::optional<std::string> before = read(changed.before);
    if (!before && !after) return pair;
    pair.reason = ReasonAgainst(file.oldPath, before);
    if (pair.reason.empty()) pair.reason = ReasonAgainst(file.newPath, after);
    // The newer version was passed over before the older one was known.
    if (changed.after && !after) pair.reason = TellKind(Printable(file.newPath), SceneKind::NoScene);
    if (!pair.reason.empty()) return pair;
    pair.isScene = true;
    if (!before) before = EmptyScene(*after);
    if (!after) after = EmptyScene(*before);
    pair.before = std::move(*before);
    pair.after = std::move(*after);
    return pair;
}

} // namespace ovrin
