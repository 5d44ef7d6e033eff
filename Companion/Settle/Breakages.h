#pragma once

#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"

#include <array>
#include <cstddef>
#include <map>
#include <unordered_map>
#include <unordered_set>
#include <utility>
#include <vector>

namespace ovrin {

/// A place in a merged scene where two objects don't fit together, as far as no version has it so.
struct Breakage {
    enum class Kind {
        Dangling,      ///< `object` refers to `other`, which is gone
        LostParent,    ///< `object` stands at the top, since `other`, which it stood under, is gone
        NotListed,     ///< a list of `other` lacks `object`, which says that it belongs there
        Loop,          ///< `object` stands below `other`, and that, with others between, below it
        WronglyListed, ///< a list of `object` has `other`, which says that it belongs elsewhere
    };
    Kind kind;
    MergeNames::ID object, other;
    /// Of Dangling the value in `object`, by keys and indexes; else the list in its owner, or m_Father.
    ovrin_yaml::Path place;
};

/// Finds them in what the sides changed. The merge must have been merged.
class Breakages {
public:
    Breakages(SceneMerge& merge, const MergeNames& names);

    std::vector<Breakage> Find();

private:
    using ID = MergeNames::ID;
    /// In the order of Version, and the result.
    static constexpr std::size_t kResult = 3;

    ObjectBody Body(std::size_t tree, ID id) const;
    bool Has(std::size_t tree, ID id) const { return m_Trees[tree]->HasKey(id); }
    bool IsGone(std::size_t tree, ID id) const;
    bool RefersTo(std::size_t tree, ID object, ID other) const;
    const std::unordered_set<ID>& Listed(std::size_t tree, ID owner, ID list);
    template <class IsSo> bool IsOld(const IsSo& isSo) const;

    void LookAt(ID object);
    void LookAtReferences(ID object, const ObjectBody& body);
    void LookAtParent(ID object, const ObjectBody& body);
    bool IsInLoop(std::size_t tree, ID transform);
    void LookIfListed(ID object, const ObjectBody& body, ID back, ID list);
    void LookAtList(ID owner, const ObjectBody& body, ID list, ID back);

    SceneMerge& m_Merge;
    const std::array<const ovrin_yaml::YAMLMapping*, 4> m_Trees;
    std::map<std::pair<std::size_t, const ovrin_yaml::YAMLNode*>, std::unordered_set<ID>> m_Lists;
    std::array<std::unordered_map<ID, bool>, 4> m_InLoops; // those that were asked for, and what is above
    std::vector<Breakage> m_Found;
};

} // namespace ovrin
