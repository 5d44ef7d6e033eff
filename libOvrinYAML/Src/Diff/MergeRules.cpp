#include "Diff/MergeRules.h"

#include "Values/YAMLMapping.h"

#include <algorithm>

namespace ovrin_yaml {

MergeRules::MergeRules()
    : m_DefaultRule{SequenceType::Set, {{YAMLScalar::fileID}}, true},
      m_KeyListRule{SequenceType::Set, {{YAMLScalar::underscore}}, false} {}

void MergeRules::AddSequenceUniqueKeys(SequenceType type, const Path& path, const std::vector<Path>& keys) {
    if (type == SequenceType::Plain)
        m_ListRules.push_back({path, {type, {}, false}});
    else
        m_ListRules.push_back({path, {type, keys, keys == m_DefaultRule.keys}});
}

void MergeRules::AddExclusionFieldPath(const Path& path, bool exclude) {
    m_Exclusions.push_back({path, {}, !exclude});
}

void MergeRules::AddExclusionIfContainsFieldPath(const Path& path, const std::vector<Path>& fieldPaths,
                                                 bool exclude) {
    m_ConditionalExclusions.push_back({path, fieldPaths, !exclude});
}

void MergeRules::AddComparisonFieldPath(const Path& path, float relative, float absolute) {
    m_Comparisons.push_back({path, {relative, absolute}});
}

bool MergeRules::MatchesPath(const Path& pattern, const Path& path) {
    return std::equal(pattern.begin(), pattern.end(), path.begin(), path.end(),
                      [](const YAMLScalar* rule, const YAMLScalar* element) {
                          return rule == YAMLScalar::star || rule == element;
                      });
}

std::size_t MergeRules::LongestPath() const {
    std::size_t longest = 1; // that of key lists
    const auto count = [&](const Path& pattern) { longest = std::max(longest, pattern.size()); };
    for (const SequenceInfo& rule : m_ListRules) count(rule.path);
    for (const ExclusionInfo& rule : m_Exclusions) count(rule.path);
    for (const ExclusionInfo& rule : m_ConditionalExclusions) count(rule.path);
    for (const auto& rule : m_Comparisons) count(rule.first);
    return longest;
}

const ListRule& MergeRules::SelectKeyPaths(const Path& path) const {
    if (path.size() == 1 && path[0] == YAMLScalar::underscore) return m_KeyListRule;
    for (const SequenceInfo& rule : m_ListRules)
        if (MatchesPath(rule.path, path)) return rule.list;
    return m_DefaultRule;
}

const YAMLNode* MergeRules::GetYAMLNodeFieldByPath(const YAMLNode* node, const Path& fieldPath) {
    for (const YAMLScalar* element : fieldPath) {
        if (!node || element == YAMLScalar::underscore) continue;
        const YAMLMapping* mapping = AsMapping(node);
        if (!mapping)
            node = nullptr;
        else if (element == YAMLScalar::star)
            node = mapping->Size() ? mapping->First() : nullptr;
        else
            node = mapping->Get(element);
    }
    return node;
}

std::vector<const YAMLScalar*> MergeRules::GetUniqueMappingValues(const std::vector<Path>& fieldPaths,
                                                                  const YAMLNode* node) {
    std::vector<const YAMLScalar*> values;
    values.reserve(fieldPaths.size());
    for (const Path& fieldPath : fieldPaths) {
        const YAMLScalar* value = AsScalar(GetYAMLNodeFieldByPath(node, fieldPath));
        if (!value) return {};
        values.push_back(value);
    }
    return values;
}

std::optional<bool> MergeRules::FindExclusion(const Path& path) const {
    for (const ExclusionInfo& rule : m_Exclusions)
        if (MatchesPath(rule.path, path)) return rule.mergeable;
    return std::nullopt;
}

std::optional<bool> MergeRules::FindExclusion(const Path& path, const YAMLNode* node) const {
    for (const ExclusionInfo& rule : m_ConditionalExclusions)
        if (MatchesPath(rule.path, path) && !GetUniqueMappingValues(rule.fieldPaths, node).empty())
            return rule.mergeable;
    return std::nullopt;
}

std::optional<Tolerance> MergeRules::FindTolerance(const Path& path) const {
    for (const auto& [pattern, tolerance] : m_Comparisons)
        if (MatchesPath(pattern, path)) return tolerance;
    return std::nullopt;
}

} // namespace ovrin_yaml
