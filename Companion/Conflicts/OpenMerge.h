#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ovrin {

/// The version of a scene, or of a value in it, that somebody wants.
enum class Side { Base, Ours, Theirs };

/// "base", "ours" and "theirs".
const char* SideName(Side side);
/// The side of that name. Throws Failure.
Side SideNamed(std::string_view name);

/// The texts of a merge.
struct ThreeTexts {
    std::string base, ours, theirs;
};

/// What the sides of a merge are to the one who makes it.
struct Occasion {
    std::string action; ///< "merge", "rebase", "cherry-pick", "revert", "stash"...; empty: unknown
    std::string base, ours, theirs; ///< branches or commits; empty where they aren't known
    std::string head;               ///< the commit that the merge began from; empty where it isn't known
};

/// What a person wants at the conflicts of a path, in which "*" stands for any one element.
struct Decision {
    std::string path;
    Side side;

    bool operator==(const Decision&) const = default;
};

/// A merge of a scene that needs a person: what it was made from, and how.
struct OpenMerge {
    std::string path; ///< of the scene, from the top of the working tree
    Occasion occasion;
    Side take = Side::Ours;      ///< what stands at open conflicts in the result that was left
    bool isBothAdded = false;    ///< there is no base: the union is to be looked through
    std::string rules, typeInfo; ///< files that were named; empty for none
    std::size_t conflicts = 0;   ///< open ones, in the beginning
    std::string identity;        ///< of this merge; another one of the same scene has another
    std::string process;         ///< of version control, which asked for it; empty where it isn't known
    ThreeTexts texts;            ///< empty where only the rest was asked for
};

/// Decisions that were made at once, and are taken back at once.
struct DecisionStep {
    std::size_t decisions; ///< how many
    /// Counted over all scenes that are settled together: steps of one number are one.
    std::uint64_t number;

    bool operator==(const DecisionStep&) const = default;
};

/// How far a person has come with an open merge.
struct Progress {
    std::vector<Decision> decisions;      ///< in the order in which they were made
    std::size_t open = 0;                 ///< conflicts that are left
    std::vector<DecisionStep> steps = {}; ///< of all decisions, in order
};

} // namespace ovrin
