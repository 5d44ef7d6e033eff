#pragma once

#include "Conflicts/OpenMerge.h"
#include "Conflicts/SceneMerge.h"
#include "Names/MergeNames.h"
#include "Names/RecordPlace.h"

#include <array>
#include <cstddef>
#include <nlohmann/json_fwd.hpp>
#include <string>
#include <vector>

namespace ovrin {

/// The version of the scene that the side has.
Version VersionOf(Side side);

/// An open conflict for a person.
struct Conflict {
    std::string path;     ///< as decisions name it: "734813.MonoBehaviour.m_Brightness"
    std::string id;       ///< of the object; empty for the order of keys, which names none
    std::string object;   ///< "Harbour/Lantern · Light"; empty like the id
    std::string heading;  ///< the same with the id, and the name that other sides have
    std::string property; ///< "m_Brightness"; empty for the object as a whole
    ConflictKind kind;
    /// The values, in the order of Side; null where a side has none. They belong to the merge.
    std::array<const ovrin_yaml::YAMLNode*, 3> values;
    /// The same in words on one line, whatever the side has or did: "4.5", "removed", "changed m_Layer".
    std::array<std::string, 3> words;
    /// What it does to take a side: "take ours", "remove it"; "below Harbour/Pier" or "at the top" for
    /// objects that were moved below each other; "keep Light", "remove Light and what needs it" where it is
    /// needed.
    std::array<std::string, 3> choices;

    const ovrin_yaml::YAMLNode* In(Side side) const { return values[static_cast<std::size_t>(side)]; }
    const std::string& WordsOf(Side side) const { return words[static_cast<std::size_t>(side)]; }
    const std::string& ChoiceOf(Side side) const { return choices[static_cast<std::size_t>(side)]; }
};

/// "both changed it", "theirs removed it and ours changed it"...
const char* WhatHappened(ConflictKind kind);
/// The stable name for scripts: "both-changed", "both-added", "theirs-removed", "parent-loop",
/// "broken-requirement", "key-order".
const char* CodeOf(ConflictKind kind);

/// Puts the conflicts of one merge into words. For one thread at a time, as long as the merge lives.
class ConflictWords {
public:
    /// The merge must have been merged. Words for values have at most `width` characters each; 0 is no limit.
    explicit ConflictWords(SceneMerge& merge, std::size_t width = 0);

    const MergeNames& Names() const { return m_Names; }
    Conflict Describe(const OpenConflict& open) const;
    /// The first `most` of the open conflicts of the merge, all for 0. Those of one object stand together,
    /// and objects as in the hierarchy.
    std::vector<Conflict> DescribeOpen(std::size_t most = 0) const;

private:
    std::string ValueWords(const OpenConflict& open, const Conflict& conflict, const RecordPlace& place,
                           Side side) const;
    std::string ChoiceWords(const OpenConflict& open, const Conflict& conflict, Side side) const;
    std::string RequirementChoice(const OpenConflict& open, Side side) const;

    SceneMerge& m_Merge;
    const std::size_t m_Width;
    const MergeNames m_Names;
    const RecordPlaces m_Places;
};

/// A conflict as all commands give it to scripts:
///
///     {"path": "734813.Light.m_Brightness", "kind": "both-changed",
///      "object": {"id": "734813", "name": "Harbour/Lantern · Light"}, "property": "m_Brightness",
///      "base": {"value": "1", "text": "1"}, "ours": ..., "theirs": ...,
///      "choices": {"base": "take base", "ours": ..., "theirs": ...}}
///
/// "object" is null for the order of keys. A value is the tree, of texts alone, and null where there is none.
nlohmann::json ToJson(const Conflict& conflict);

} // namespace ovrin
