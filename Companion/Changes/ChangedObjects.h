#pragma once

#include "Changes/PropertyChanges.h"
#include "Changes/SceneChange.h"

#include <optional>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {
class YAMLMappingDiff;
}

namespace ovrin {

/// Which objects changed from one version of a scene to another, and how, without what follows from another
/// change: that an added, removed or moved object appears in or goes from the list of its parent.
///
/// All that is given must outlive it. For one thread at a time.
class ChangedObjects {
public:
    using ID = ObjectNames::ID;

    /// `diff` is what makes the one version the other, by these rules. Values are told in `width` characters;
    /// 0: all.
    ChangedObjects(const ObjectNames& before, const ObjectNames& after,
                   const ovrin_yaml::YAMLMappingDiff& diff, const ovrin_yaml::MergeRules& rules,
                   std::size_t width = 0);

    /// All that may have changed: what the diff names, and places whose Transform went elsewhere.
    std::vector<ID> Candidates() const;

    struct Change {
        ChangeKind kind;
        bool isMoved = false;      ///< stands under another parent
        ID formerParent = nullptr; ///< of what moved; null at the top
    };
    /// What became of an object; nothing where nothing did but what follows from another change.
    std::optional<Change> Find(ID id);
    /// The properties of one that changed.
    std::vector<PropertyChange> Properties(ID id);
    /// The fields of one that was added or removed.
    std::vector<PropertyChange> Fields(ID id, ChangeKind kind) { return m_Properties.Fields(id, kind); }

private:
    void FindMove(ID id, const ovrin_yaml::Operation& operation);
    bool ChangesProperty(ID id, const ovrin_yaml::Operation& operation);
    bool IsToldElsewhere(ID list, const ovrin_yaml::YAMLNode* item) const;

    const ObjectNames& m_Before;
    const ObjectNames& m_After;
    const ovrin_yaml::YAMLMappingDiff& m_Diff;
    PropertyChanges m_Properties;
    std::unordered_map<ID, ID> m_FormerParents; // of places that moved; null for the top
};

} // namespace ovrin
