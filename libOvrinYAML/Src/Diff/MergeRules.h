#pragma once

#include "Values/YAMLScalar.h"

#include <iosfwd>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace ovrin_yaml {

/// How the elements of a list are matched: by key, or by equality.
enum class SequenceType { Set = 0, Plain = 1 };

struct SequenceInfo {
    SequenceType type;
    Path path;              // pattern of the lists' property paths
    std::vector<Path> keys; // field paths whose values form an element's key
};

struct ExclusionInfo {
    Path path;                    // pattern of property paths
    std::vector<Path> fieldPaths; // the rule applies where each leads to a scalar
    bool mergeable;
};

/// What the rules file tells about the file format: by which fields list elements are identified, which
/// properties are never merged field by field, and which floats count as unchanged within a tolerance.
///
/// Process-wide state: filled on the main thread before any diff is made, then read by all threads without a
/// lock. Every list keeps file order and every lookup takes the first hit.
///
/// A rule's path is a pattern: it matches a property path of the same length whose elements are the rule's,
/// with "*" for any one element. A field path leads from a node to one of its fields: a key each, "_" stays
/// where it is, "*" takes the first value of a mapping.
class MergeRules {
public:
    static std::vector<SequenceInfo> s_ArrayUniqueKeyMap;
    static std::vector<std::pair<Path, bool>> s_ExclusionFieldPaths; // path, mergeable
    static std::vector<std::pair<Path, std::tuple<float, float>>>
        s_ComparisonFieldPaths; // relative, absolute
    static std::vector<ExclusionInfo> s_DiffExclusionFieldPaths;
    static bool s_PremergeBaseValues;
    static std::vector<Path> defaultPath;       // fileID: the key of lists that no rule names
    static std::vector<Path> defaultDirectPath; // _: elements are their own keys, as in a mapping's key list
    static const std::vector<Path> noPaths;

    /// Fills the default key paths. LoadSequenceUniqueKeys does it first.
    static void Initialize();
    /// Appends the rules of a rules file. Throws std::runtime_error with the number of the first bad line;
    /// the rules above it stay.
    static void LoadSequenceUniqueKeys(std::istream& in);
    /// Appends the pieces of `text` between separators to `tokens`, empty ones left out.
    static void Tokenize(const std::string& text, char separator, std::vector<std::string>& tokens);

    static void AddSequenceUniqueKeys(SequenceType type, const Path& path, const std::vector<Path>& keys);
    static void AddExclusionFieldPath(const Path& path, bool exclude);
    static void AddExclusionIfContainsFieldPath(const Path& path, const std::vector<Path>& fieldPaths,
                                                bool exclude);
    static void AddComparisonFieldPath(const Path& path, float relative, float absolute);
    /// Empties everything, the default key paths too, so that tests don't see each other's rules.
    static void ResetForTests();

    static bool MatchesPath(const Path& pattern, const Path& path);
    /// Elements of the longest path that a rule can match; at longer ones no rule makes a difference.
    static std::size_t LongestPath();
    /// The field paths that form the keys of the list at `path`; none if it is matched by equality.
    static const std::vector<Path>& SelectKeyPaths(const Path& path);
    /// The node at a field path, or null. Throws YAMLError at a mapping in the duplicate state.
    static const YAMLNode* GetYAMLNodeFieldByPath(const YAMLNode* node, const Path& fieldPath);
    /// The scalar at each field path, in their order; empty if one of them is absent or no scalar.
    static std::vector<const YAMLScalar*> GetUniqueMappingValues(const std::vector<Path>& fieldPaths,
                                                                 const YAMLNode* node);
    /// Whether changes of both sides below `path` may be combined, by the rules that look at the path alone.
    static bool IsMergeablePath(const Path& path);
    /// The same by the rules that look at the fields of `node`, the value at `path`.
    static bool IsMergeablePath(const Path& path, const YAMLNode* node);
    /// Whether the premerged base holds blanks where both sides conflict.
    static bool CheckBlankPremergeBaseEnabled() { return s_PremergeBaseValues; }
};

} // namespace ovrin_yaml
