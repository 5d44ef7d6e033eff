#include "Changes/FileChange.h"

#include "Changes/ScenePair.h"
#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"

#include "Session/MergeSession.h"

#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

SceneChange Compare(const FilePair& file, ScenePair pair, const MergeRules& rules, const ChangeWish& wish) {
    MergeSession session;
    session.SetRules(rules);
    session.Read({TextInput(Printable(file.oldPath), std::move(pair.before)),
                  TextInput(Printable(file.newPath), std::move(pair.after))});
    session.Prepare();
    session.Diff();
    return ListChanges(session, wish.width, wish.withValues);
}

} // namespace

FileChange CompareFile(const ChangedFile& changed, const MergeRules& rules, const ChangeWish& wish) {
    ScenePair pair = ReadScenePair(changed);
    FileChange change{changed.file, std::nullopt, pair.reason};
    if (!pair.isScene) return change;
    try {
        change.scene = Compare(changed.file, std::move(pair), rules, wish);
    } catch (const MergeError& error) {
        change.reason = Printable(error.what());
        if (error.stage == MergeError::Stage::Read) change.reason += kCureOfUnreadable;
    }
    return change;
}

} // namespace ovrin
