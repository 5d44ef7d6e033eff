#pragma once

#include "Conflicts/LiveMerges.h"
#include "Conflicts/OpenMerges.h"
#include "Settle/EarlierDecisions.h"
#include "Settle/SceneCount.h"
#include "Settle/SettleSession.h"
#include "Systems/Repository.h"

#include <memory>
#include <set>
#include <span>
#include <string>
#include <vector>

namespace ovrin {

class IndexMerges;

/// What became of something, in words for people.
using Remarks = std::vector<std::string>;

/// The scenes of a working tree that are to be settled together: from what version control and the records
/// say of them to the settled files.
class SettleScenes {
public:
    /// Finds what is open in the working tree around the present folder, and forgets what is over; `remarks`
    /// tells of that. Throws Failure where there is no working tree.
    explicit SettleScenes(Remarks& remarks);

    const Repository& Where() const { return m_Repository; }
    /// Leaves the scenes at and below these places, as the user types them. Throws Failure for one that
    /// matches nothing.
    void LimitTo(std::span<const std::string> places);
    /// The paths of all that is left, in order.
    std::vector<std::string> Paths() const;

    /// How far all that is left is. Scenes of which nothing is written down are merged for it.
    std::vector<SceneCount> Count() const;
    /// Reads and merges all that is left, each with its decisions. What can't be is told in `remarks`, stays
    /// out of Sessions, and is counted.
    std::size_t Open(Remarks& remarks);
    /// What couldn't be read, and why, as it was told.
    const std::vector<SceneCount>& Unreadable() const { return m_Unreadable; }
    const std::vector<std::unique_ptr<SettleSession>>& Sessions() const { return m_Sessions; }

    /// Writes the decisions of a session down, unless it is finished.
    void Keep(SettleSession& session) {
        if (!m_Finished.contains(session.Source().path)) session.Keep(m_Store);
    }
    /// Finishes the sessions in which nothing is open: each result becomes its scene's file, version control
    /// is told that it is merged, what was decided is kept for proposals, and the record goes. A file that
    /// somebody changed since the merge is replaced only if `overwrite`, and none whose merge was ended, made
    /// again or settled elsewhere since it was read. Returns the paths of those that are
    /// finished; `remarks` tells of the others. Until the record goes, doing it again completes what was
    /// interrupted.
    std::vector<std::string> Finish(bool overwrite, Remarks& remarks);
    /// Those remarks of the last Finish that are about files that it would replace if it may `overwrite`.
    const Remarks& ChangedByHand() const { return m_ChangedByHand; }

    /// Takes the files of the scenes that are left as they stand, whatever was decided. Throws Failure for
    /// one with conflict markers or that isn't there, and takes none then.
    void TakeAsTheyStand();
    /// Forgets the records of the scenes that are left, and nothing else.
    void Forget();

private:
    std::unique_ptr<SettleSession> Load(IndexMerges& index, const std::string& path, Remarks& remarks);
    SceneCount CountUnrecorded(IndexMerges& index, const std::string& path) const;
    void Conclude(const std::vector<std::string>& paths);
    void Remember(const std::string& path, Remarks& remarks);
    void RememberDecided(const std::vector<std::string>& paths, Remarks& remarks);
    bool IsRecorded(const std::string& path) const;
    std::vector<SettleSession*> ToFinish() const;
    std::set<std::string> PathsStillOpen(const std::vector<SettleSession*>& sessions) const;
    std::string FileOf(const std::string& path) const { return m_Repository.top + "/" + path; }
    bool IsUntouched(SettleSession& session, const std::string& result) const;
    bool Holds(const std::string& path, const std::string& file, const std::string& bytes) const;

    const Repository m_Repository;
    OpenMerges m_Store;
    EarlierDecisions m_Earlier;
    LiveMerges m_Live;
    std::vector<std::unique_ptr<SettleSession>> m_Sessions;
    std::vector<SceneCount> m_Unreadable;
    Remarks m_ChangedByHand;
    std::set<std::string> m_Finished; // paths; their files are nobody's business any more
};

/// Keeps what was decided in the record of a scene, if there is one, to be proposed where the same is met
/// again: ahead of whatever replaces or removes it. Returns of how many conflicts. Throws Failure.
std::size_t RememberDecisions(const Repository& repository, const std::string& path);

/// Forgets the record of a file that was settled in another way, if there is one. The file may be anywhere.
void ForgetSettledFile(const std::string& given);

} // namespace ovrin
