#pragma once

#include "Conflicts/SceneMerge.h"
#include "Names/RecordPlace.h"

#include <array>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace ovrin {

struct Repository;

/// What was decided in scenes that were settled, to be proposed where the same conflict is met again: one of
/// the same path and the same three values, of whichever scene, as a rebase brings them. Ours and theirs may
/// have changed places, since a rebase swaps them.
///
/// It is kept for each working tree beside the data of its version control system, in the file
/// "ovrin/decisions": a line with a key, and one for each decision with a hash under that key, which stands
/// for the path and the values, and the side. So the file tells nothing of the scenes, and no scene can be
/// made up that has another one's hashes. The last kMost decisions are kept.
///
/// Any number of processes may read it, since it is replaced as a whole. Of two that write at the same time
/// one's decisions may be missing afterwards: they are decided once more, then.
class EarlierDecisions {
public:
    static constexpr std::size_t kMost = 50000;

    /// What makes a conflict the same as another.
    struct Values {
        std::string path; ///< as decisions name it
        /// In the order of Side; null where a side has none.
        std::array<const ovrin_yaml::YAMLNode*, 3> values;

        /// Nothing for a conflict that has no values: one of the order of fields.
        static std::optional<Values> Of(const OpenConflict& conflict, const RecordPlaces& places);
    };

    explicit EarlierDecisions(const Repository& repository);

    /// Reads what is kept; nothing where there is no file. Throws Failure for one that can't be read or made
    /// out; then it is empty, and Keep replaces the file.
    void Read();
    bool IsEmpty() const { return m_Sides.empty(); }

    /// What was decided of the conflict, or nothing.
    std::optional<Side> Find(const Values& conflict) const;
    /// The last decision of a conflict counts.
    void Add(const Values& conflict, Side side);
    /// Writes down what was added. Throws Failure.
    void Keep() const;

private:
    using Key = std::array<std::uint64_t, 2>;
    struct Decided {
        Side side;
        std::uint64_t number; ///< counts up: the least is the oldest
    };
    Key KeyOf(const Values& conflict) const;
    void ReadLines(const std::string& text);

    const std::string m_Folder;
    Key m_Secret;
    std::map<Key, Decided> m_Sides;
    std::uint64_t m_Next = 0;
};

} // namespace ovrin
