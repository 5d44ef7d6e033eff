#pragma once

#include "Values/YAMLScalar.h"

#include <cstddef>
#include <optional>
#include <utility>
#include <vector>

namespace ovrin_yaml {

/// How the elements of a list are matched: by key, or by equality.
enum class SequenceType { Set = 0, Plain = 1 };

/// What identifies the elements of a list.
struct ListRule {
    SequenceType kind;
    std::vector<Path> keys; // field paths whose values form an element's key; none for a plain list
    bool isDefault;         // the keys are those of a list that no rule names
};

struct SequenceInfo {
    Path path; // pattern of the lists' property paths
    ListRule list;
};

struct ExclusionInfo {
    Path path; // pattern of property paths
    std::vector<Path>
        fieldPaths; // the rule applies where each leads to a scalar; none: wherever the path does
    bool mergeable;
};

/// Two floats count as equal that differ by less than the larger of the two bounds.
struct Tolerance {
    float relative, absolute;
};

/// What the rules file tells about the file format: by which fields list elements are identified, which
/// properties are never merged field by field, and which floats count as unchanged within a tolerance.
///
/// A value: filled first, then only read, by any number of threads. Diffs and resolvers keep a reference to
/// it. Every list keeps file order and every lookup takes the first hit.
///
/// A rule's path is a pattern: it matches a property path of the same length whose elements are the rule's,
/// with "*" for any one element. A field path leads from a node to one of its fields: a key each, "_" stays
/// where it is, "*" takes the first value of a mapping.
class MergeRules {
public:
    /// No rules but the two that always hold: the elements of lists that no rule names have their file id as
    /// key, and those of a mapping's key list are their own keys.
    MergeRules();

    /// The keys of a plain list don't count.
    void AddSequenceUniqueKeys(SequenceType type, const Path& path, const std::vector<Path>& keys);
    void AddExclusionFieldPath(const Path& path, bool exclude);
    void AddExclusionIfContainsFieldPath(const Path& path, const std::vector<Path>& fieldPaths, bool exclude);
    void AddComparisonFieldPath(const Path& path, float relative, float absolute);
    void EnableBlankPremergeBase() { m_PremergeBaseValues = true; }

    const std::vector<SequenceInfo>& ListRules() const { return m_ListRules; }
    const std::vector<ExclusionInfo>& Exclusions() const { return m_Exclusions; }
    const std::vector<ExclusionInfo>& ConditionalExclusions() const { return m_ConditionalExclusions; }
    const std::vector<std::pair<Path, Tolerance>>& Comparisons() const { return m_Comparisons; }

    /// Elements of the longest path that a rule can match; at longer ones no rule makes a difference.
    std::size_t LongestPath() const;
    /// What identifies the elements of the list at `path`.
    const ListRule& SelectKeyPaths(const Path& path) const;
    /// Whether changes of both sides below `path` may be combined, by the rules that look at the path alone.
    bool IsMergeablePath(const Path& path) const { return FindExclusion(path).value_or(true); }
    /// The same by the rules that look at the fields of `node`, the value at `path`.
    bool IsMergeablePath(const Path& path, const YAMLNode* node) const {
        return FindExclusion(path, node).value_or(true);
    }
    /// What the first of these rules says, or nothing where there is none.
    std::optional<bool> FindExclusion(const Path& path) const;
    std::optional<bool> FindExclusion(const Path& path, const YAMLNode* node) const;
    std::optional<Tolerance> FindTolerance(const Path& path) const;
    /// Whether the premerged base holds blanks where both sides conflict.
    bool CheckBlankPremergeBaseEnabled() const { return m_PremergeBaseValues; }

    static bool MatchesPath(const Path& pattern, const Path& path);
    /// The node at a field path, or null. Throws YAMLError at a mapping in the duplicate state.
    static const YAMLNode* GetYAMLNodeFieldByPath(const YAMLNode* node, const Path& fieldPath);
    /// The scalar at each field path, in their order; empty if one of them is absent or no scalar.
    static std::vector<const YAMLScalar*> GetUniqueMappingValues(const std::vector<Path>& fieldPaths,
                                                                 const YAMLNode* node);

private:
    ListRule m_DefaultRule, m_KeyListRule;
    std::vector<SequenceInfo> m_ListRules;
    std::vector<ExclusionInfo> m_Exclusions; // by the path alone
    std::vector<ExclusionInfo> m_ConditionalExclusions;
    std::vector<std::pair<Path, Tolerance>> m_Comparisons;
    bool m_PremergeBaseValues = false;
};

} // namespace ovrin_yaml
