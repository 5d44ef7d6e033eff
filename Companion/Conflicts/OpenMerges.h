#pragma once

#include "Conflicts/OpenMerge.h"

#include <optional>
#include <string>
#include <vector>

namespace ovrin {

struct Repository;

/// The open merges of a working tree. They stand beside the data of its version control system, in the folder
/// "ovrin", two files for each:
///
///     NUMBER.merge      a line of JSON with sizes; then the path, base, ours and theirs, byte for byte
///     NUMBER.progress   JSON; of an earlier merge, and nothing, unless the identity is the merge's
///
/// The number comes from the path. Each file is replaced as a whole, so that any number of processes may work
/// here; of two that decide in one scene the second is refused. All functions throw Failure for what the
/// system refuses and for files that can't be made out.
class OpenMerges {
public:
    explicit OpenMerges(const Repository& repository);

    /// Writes the merge down, in place of an earlier one of the scene, and gives it its identity.
    void Add(OpenMerge& merge);
    /// All of them without their texts, in the order of their paths.
    std::vector<OpenMerge> List() const;
    /// The one of a scene with its texts, or nothing.
    std::optional<OpenMerge> Find(const std::string& path) const;
    /// Whether there is one of a scene.
    bool Has(const std::string& path) const { return PlaceOf(path).isTaken; }
    /// Whether any of them was asked for by the same process of version control, in the same merge.
    bool HasFellowOf(const OpenMerge& merge) const;
    /// How far it has come: nothing settled if nothing is known.
    Progress ProgressOf(const OpenMerge& merge) const;
    /// Whether nobody has made the merge again, ended it or decided in it since its progress was `known`. One
    /// that has no identity wasn't written down.
    bool IsStill(const OpenMerge& merge, const Progress& known) const;
    /// Writes down how far it has come, and the merge itself if it has no identity yet. Throws Failure, and
    /// writes nothing, unless all IsStill.
    void SetProgress(OpenMerge& merge, const Progress& known, const Progress& progress);
    /// Forgets the one of a scene, if there is one.
    void Remove(const std::string& path);

private:
    struct Place {
        std::string file; ///< without its extension
        bool isTaken;     ///< by the scene
    };
    Place PlaceOf(const std::string& path) const;
    void MakeFolder() const;

    std::string m_Folder;
};

} // namespace ovrin
