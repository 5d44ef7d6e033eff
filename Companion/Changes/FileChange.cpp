#include "Changes/FileChange.h"

#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"

#include "Reading/DocumentCut.h"
#include "Session/MergeSession.h"

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

SceneChange Compare(const FilePair& file, const std::optional<std::string>& before,
                    const std::optional<std::string>& after, const MergeRules& rules,
                    const ChangeWish& wish) {
    MergeSession session;
    session.SetRules(rules);
    session.Read({TextInput(Printable(file.oldPath), before ? *before : EmptyScene(*after)),
                  TextInput(Printable(file.newPath), after ? *after : EmptyScene(*before))});
    session.Prepare();
    session.Diff();
    return ListChanges(session, wish.width, wish.withValues);
}

} // namespace

FileChange CompareFile(const ChangedFile& changed, const MergeRules& rules, const ChangeWish& wish) {
    const FilePair& file = changed.file;
    FileChange change{file, std::nullopt, ""};
    const bool hasBoth = changed.before && changed.after;
    if (!hasBoth && file.status != FileStatus::Added && file.status != FileStatus::Removed) return change;
    bool isMeant = IsSceneName(file.newPath);
    const IsWanted isWanted = [&isMeant](std::string_view beginning) {
        isMeant = isMeant || HasSignature(beginning);
        return isMeant;
    };
    const auto read = [&](const FileVersion& version) { return version ? version(isWanted) : std::nullopt; };
    const std::optional<std::string> after = read(changed.after);
    const std::optional<std::string> before = read(changed.before);
    if (!before && !after) return change;
    change.reason = ReasonAgainst(file.oldPath, before);
    if (change.reason.empty()) change.reason = ReasonAgainst(file.newPath, after);
    // The newer version was passed over before the older one was known.
    if (changed.after && !after) change.reason = TellKind(Printable(file.newPath), SceneKind::NoScene);
    if (!change.reason.empty()) return change;
    try {
        change.scene = Compare(file, before, after, rules, wish);
    } catch (const MergeError& error) {
        change.reason = Printable(error.what());
    }
    return change;
}

} // namespace ovrin
