#pragma once

#include "Diff/DiffContext.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <cstddef>
#include <unordered_map>
#include <utility>

namespace ovrin_yaml {

/// Tells whether the diff of two values would have entries, without building it.
///
/// The answer is that of CreateDiffOperation in every respect, the same throw at repeated keys included:
/// whatever the diff would look into is looked into. Paths count from the values that are asked about, as in
/// a diff of these two alone, and the rules go by them.
///
/// A merge asks about a pair of added values, then about the pairs in them, level by level. Below the reach
/// of the longest rule the path makes no difference any more, so that an answer holds for every later
/// question:
///
///     question 1   a  b  c  d  e  f       rules of at most 3 elements: what was found at d is kept
///     question 2      b  c  d  e  f       b, c and d are looked at again, e is known
///
/// So all questions about a tree together cost its size times the length of the longest rule. The values must
/// stay as they are, and the rules too, as long as the check is in use. Belongs to one thread.
class DifferenceCheck {
public:
    explicit DifferenceCheck(const MergeRules& rules);

    bool Differ(const YAMLMapping* base, const YAMLMapping* dest);
    /// Position by position.
    bool Differ(const YAMLSequence* base, const YAMLSequence* dest);

private:
    using Pair = std::pair<const YAMLNode*, const YAMLNode*>;
    struct PairHash {
        std::size_t operator()(const Pair& pair) const;
    };

    template <class Container> bool ChildrenDiffer(const Container& base, const Container& dest);
    /// Whether two nodes at the current path differ that don't count as equal; one of them may be null.
    bool DifferAtPath(const YAMLNode* base, const YAMLNode* dest);
    /// The same for two mappings or two sequences.
    bool ContainersDiffer(const YAMLNode* base, const YAMLNode* dest);
    /// Throws where the rules that look at fields would meet repeated keys.
    void LetRulesLook(const YAMLNode* node) const;

    DiffContext m_Context;
    const std::size_t m_LongestRule;
    std::unordered_map<Pair, bool, PairHash> m_Known; // pairs of containers out of the rules' reach
};

} // namespace ovrin_yaml
