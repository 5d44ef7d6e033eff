#include "Settle/SettleScenes.h"

#include "Conflicts/IndexMerges.h"
#include "Destination.h"
#include "FileUtils.h"
#include "Names/PrintableText.h"
#include "Scenes/SceneFile.h"
#include "Settle/DecisionTable.h"
#include "Systems/Git.h"
#include "Systems/Operation.h"
#include "Systems/UnmergedFiles.h"
#include "Systems/WorkingPath.h"
#include "Words/Failure.h"

#include <algorithm>
#include <filesystem>
#include <system_error>

namespace ovrin {

namespace {

Repository RepositoryHere() {
    const std::optional<Repository> found = FindRepository();
    if (!found || found->top.empty())
        throw Failure("There is no working tree of git, Mercurial or Subversion here: change to one");
    return *found;
}

/// What version control is in the midst of looks like what is over: nothing is stale that it was at work on
/// before or after.
LiveMerges LookAtMerges(const Repository& repository, const OpenMerges& store) {
    const bool wasAtWork = IsAtWork(repository);
    LiveMerges found = FindLiveMerges(repository, store);
    if (wasAtWork || IsAtWork(repository)) found.stale.clear();
    return found;
}

/// Whether the file, or a folder above it, is a link, which may lead out of the working tree.
bool IsBehindLink(const std::string& file) {
    std::error_code error;
    return std::filesystem::is_symlink(std::filesystem::symlink_status(file, error)) ||
           std::filesystem::weakly_canonical(file, error) != file;
}

/// The bytes of a regular file; nothing where it isn't one or can't be read.
std::optional<std::string> BytesOf(const std::string& file) {
    std::error_code error;
    if (std::filesystem::symlink_status(file, error).type() != std::filesystem::file_type::regular) return {};
    std::string bytes;
    if (ReadWholeFile(file, bytes) != ReadResult::Complete) return {};
    return bytes;
}

void DeliverScene(const std::string& file, const std::string& bytes) {
    const Content content{bytes.size(), [&](OutputStream& stream) { stream << bytes; }, Durability::Synced};
    if (const int error = Deliver(file, content))
        throw Failure("The settled scene can't be written to " + Printable(file) + ": " +
                      std::system_category().message(error) +
                      "; the decisions are kept: make room, and run \"ovrin settle\" again");
}

std::string TellLink(const std::string& path) {
    return Printable(path) + " is a link or stands behind one, and nothing is written through it: take the "
                             "link away, and run \"ovrin settle --overwrite\"";
}

std::string TellOver(const std::string& path) {
    return Printable(path) + " stays as it is: since it was read here its merge was ended or made again, or "
                             "somebody else settled it. Run \"ovrin settle\" again";
}

std::string TellIdle(const std::string& path, const std::vector<std::string>& idle) {
    return Printable(path) +
           ": kept decisions that match nothing in this merge have no effect: " + Printable(idle.front()) +
           (idle.size() > 1 ? " and " + std::to_string(idle.size() - 1) + " more" : "") +
           "; \"ovrin settle --list\" shows what is open";
}

std::string TellByHand(const std::string& path) {
    return Printable(path) + " was changed by hand since it was merged, and stays as it is: \"ovrin settle "
                             "--as-is\" takes the file "
                             "as it stands, \"ovrin settle --overwrite\" puts the settled scene in its place";
}

/// That nothing can be proposed later is no reason to stop.
void KeepEarlier(const EarlierDecisions& earlier, Remarks& remarks) {
    try {
        earlier.Keep();
    } catch (const Failure& failure) {
        remarks.emplace_back(failure.what());
    }
}

/// Adds what was decided in the record of a scene, of the conflicts as they were in the beginning. Returns of
/// how many.
std::size_t TellDecidedIn(const OpenMerges& store, const std::string& path, EarlierDecisions& earlier) {
    const std::optional<OpenMerge> recorded = store.Find(path);
    const Progress progress = recorded ? store.ProgressOf(*recorded) : Progress();
    if (progress.decisions.empty()) return 0;
    SceneMerge merge = SceneMergeOf(*recorded);
    merge.Merge();
    const MergeNames names(merge.Session());
    const RecordPlaces places(merge.Session(), names);
    const DecisionTable table(progress.decisions);
    std::size_t told = 0;
    for (const OpenConflict& conflict : merge.Open()) {
        const std::optional<Side> decided = table.Find(conflict.path);
        const auto values = decided ? EarlierDecisions::Values::Of(conflict, places) : std::nullopt;
        if (!values) continue;
        earlier.Add(*values, *decided);
        ++told;
    }
    return told;
}

} // namespace

SettleScenes::SettleScenes(Remarks& remarks)
    : m_Repository(RepositoryHere()), m_Store(m_Repository), m_Earlier(m_Repository),
      m_Live(LookAtMerges(m_Repository, m_Store)) {
    try {
        m_Earlier.Read();
    } catch (const Failure& failure) {
        remarks.push_back(failure.what() + std::string("; a new one takes its place"));
        KeepEarlier(m_Earlier, remarks);
    }
    for (const OpenMerge& merge : m_Live.stale) {
        remarks.push_back(Printable(merge.path) +
                          " is forgotten: its merge was committed, given up or made again without ovrin");
        Remember(merge.path, remarks);
        m_Store.Remove(merge.path);
    }
    m_Live.stale.clear();
}

void SettleScenes::Remember(const std::string& path, Remarks& remarks) {
    try {
        if (TellDecidedIn(m_Store, path, m_Earlier)) KeepEarlier(m_Earlier, remarks);
    } catch (const Failure& failure) {
        remarks.push_back("What was decided in " + Printable(path) +
                          " can't be proposed again: " + failure.what());
    }
}

void SettleScenes::LimitTo(std::span<const std::string> places) {
    if (places.empty()) return;
    std::vector<std::string> meant;
    const std::vector<std::string> all = Paths();
    for (const std::string& given : places) {
        const std::string place = WorkingPath(m_Repository, given);
        const std::size_t before = meant.size();
        for (const std::string& path : all)
            if (IsAtOrBelow(path, place)) meant.push_back(path);
        if (meant.size() == before)
            throw Failure("No scene with open conflicts is at " + Printable(given) +
                          ": \"ovrin status\" lists them");
    }
    const auto isMeant = [&](const std::string& path) {
        return std::ranges::find(meant, path) != meant.end();
    };
    std::erase_if(m_Live.live, [&](const OpenMerge& merge) { return !isMeant(merge.path); });
    std::erase_if(m_Live.unrecorded, [&](const std::string& path) { return !isMeant(path); });
}

std::vector<std::string> SettleScenes::Paths() const {
    std::vector<std::string> paths = m_Live.unrecorded;
    for (const OpenMerge& merge : m_Live.live) paths.push_back(merge.path);
    std::ranges::sort(paths);
    return paths;
}

SceneCount SettleScenes::CountUnrecorded(IndexMerges& index, const std::string& path) const {
    try {
        return SceneCount::Of(SettleSession(index.Read(path)));
    } catch (const Failure& failure) {
        return {.path = path, .problem = failure.what()};
    }
}

std::vector<SceneCount> SettleScenes::Count() const {
    std::vector<SceneCount> counts;
    for (const OpenMerge& merge : m_Live.live)
        counts.push_back(SceneCount::Of(merge, m_Store.ProgressOf(merge)));
    IndexMerges index(m_Repository);
    for (const std::string& path : m_Live.unrecorded) counts.push_back(CountUnrecorded(index, path));
    std::ranges::sort(counts, {}, &SceneCount::path);
    return counts;
}

bool SettleScenes::IsRecorded(const std::string& path) const {
    return std::ranges::binary_search(m_Live.live, path, {}, &OpenMerge::path);
}

std::unique_ptr<SettleSession> SettleScenes::Load(IndexMerges& index, const std::string& path,
                                                  Remarks& remarks) {
    std::optional<OpenMerge> merge = IsRecorded(path) ? m_Store.Find(path) : std::nullopt;
    std::unique_ptr<SettleSession> session;
    if (merge && !index.Confirm(*merge)) {
        remarks.push_back(Printable(path) + " was merged again without ovrin: earlier decisions don't count, "
                                            "and are proposed where the same three values meet again");
        Remember(path, remarks);
        m_Store.Remove(path);
        merge.reset();
    }
    if (merge) {
        Progress progress = m_Store.ProgressOf(*merge);
        session = std::make_unique<SettleSession>(std::move(*merge), std::move(progress));
    } else {
        session = std::make_unique<SettleSession>(index.Read(path));
    }
    if (!session->Idle().empty()) remarks.push_back(TellIdle(path, session->Idle()));
    session->Propose(m_Earlier);
    return session;
}

std::size_t SettleScenes::Open(Remarks& remarks) {
    IndexMerges index(m_Repository);
    for (const std::string& path : Paths()) {
        try {
            m_Sessions.push_back(Load(index, path, remarks));
        } catch (const Failure& failure) {
            remarks.push_back(Printable(path) + " can't be settled by objects: " + failure.what() +
                              "; once you have settled it in another way: \"ovrin settle --as-is\"");
            m_Unreadable.push_back({.path = path, .problem = remarks.back()});
        }
    }
    return m_Unreadable.size();
}

bool SettleScenes::Holds(const std::string& path, const std::string& file, const std::string& bytes) const {
    if (file == bytes) return true;
    // Where git converts line ends the file has other bytes than the versions that were merged.
    return m_Repository.kind == SystemKind::Git && Git(m_Repository).StoresAs(path, bytes);
}

bool SettleScenes::IsUntouched(SettleSession& session, const std::string& result) const {
    const OpenMerge& merge = session.Source();
    const std::optional<std::string> file = BytesOf(FileOf(merge.path));
    if (!file) return false;
    // Ours is what a program that can't merge a file leaves; it is safe with version control.
    return Holds(merge.path, *file, result) || Holds(merge.path, *file, session.Left()) ||
           Holds(merge.path, *file, merge.texts.ours);
}

/// The paths of what is open in the working tree, without sessions that are no longer as they were read.
std::set<std::string> SettleScenes::PathsStillOpen(const std::vector<SettleSession*>& sessions) const {
    if (sessions.empty()) return {};
    const LiveMerges now = LookAtMerges(m_Repository, m_Store);
    IndexMerges index(m_Repository);
    std::set<std::string> open(now.unrecorded.begin(), now.unrecorded.end());
    for (const OpenMerge& merge : now.live) open.insert(merge.path);
    for (const SettleSession* session : sessions)
        if (session->IsKeptElsewhere(m_Store) || !index.Confirm(session->Source()))
            open.erase(session->Source().path);
    return open;
}

std::vector<SettleSession*> SettleScenes::ToFinish() const {
    std::vector<SettleSession*> sessions;
    for (const auto& session : m_Sessions)
        if (session->IsSettled() && !m_Finished.contains(session->Source().path))
            sessions.push_back(session.get());
    return sessions;
}

std::vector<std::string> SettleScenes::Finish(bool overwrite, Remarks& remarks) {
    const std::vector<SettleSession*> sessions = ToFinish();
    const std::set<std::string> open = PathsStillOpen(sessions);
    std::vector<std::string> finished;
    m_ChangedByHand.clear();
    for (SettleSession* session : sessions) {
        const std::string& path = session->Source().path;
        if (!open.contains(path)) {
            remarks.push_back(TellOver(path));
            continue;
        }
        const std::string result = session->Result();
        if (IsBehindLink(FileOf(path))) {
            remarks.push_back(TellLink(path));
            continue;
        }
        if (!overwrite && !IsUntouched(*session, result)) {
            m_ChangedByHand.push_back(TellByHand(path));
            remarks.push_back(m_ChangedByHand.back());
            continue;
        }
        DeliverScene(FileOf(path), result);
        finished.push_back(path);
    }
    RememberDecided(finished, remarks);
    Conclude(finished);
    m_Finished.insert(finished.begin(), finished.end());
    return finished;
}

void SettleScenes::RememberDecided(const std::vector<std::string>& paths, Remarks& remarks) {
    std::size_t told = 0;
    for (const auto& session : m_Sessions)
        if (std::ranges::find(paths, session->Source().path) != paths.end())
            told += session->TellDecided(m_Earlier);
    if (told) KeepEarlier(m_Earlier, remarks);
}

void SettleScenes::Conclude(const std::vector<std::string>& paths) {
    if (!paths.empty()) MarkMerged(m_Repository, paths);
    for (const std::string& path : paths) m_Store.Remove(path);
}

void SettleScenes::TakeAsTheyStand() {
    const std::vector<std::string> paths = Paths();
    for (const std::string& path : paths) {
        const std::optional<std::string> bytes = BytesOf(FileOf(path));
        if (!bytes)
            throw Failure(Printable(path) + " can't be taken as it stands: it is no file that can be read");
        if (ClassifyScene(*bytes) == SceneKind::Markers)
            throw Failure(Printable(path) + " can't be taken as it stands: it holds conflict markers");
    }
    Conclude(paths);
}

void SettleScenes::Forget() {
    for (const OpenMerge& merge : m_Live.live) m_Store.Remove(merge.path);
}

std::size_t RememberDecisions(const Repository& repository, const std::string& path) {
    const OpenMerges store(repository);
    if (!store.Has(path)) return 0;
    EarlierDecisions earlier(repository);
    earlier.Read();
    const std::size_t told = TellDecidedIn(store, path, earlier);
    if (told) earlier.Keep();
    return told;
}

void ForgetSettledFile(const std::string& given) {
    const std::optional<Repository> repository = FindRepository();
    if (!repository || repository->top.empty()) return;
    const std::string file = std::filesystem::weakly_canonical(given).string();
    if (!file.starts_with(repository->top + "/")) return;
    OpenMerges(*repository).Remove(WorkingPath(*repository, given));
}

} // namespace ovrin
