#include "Diff/MergeRules.h"

#include "Values/YAMLMapping.h"

#include <algorithm>

namespace ovrin_yaml {

std::vector<SequenceInfo> MergeRules::s_ArrayUniqueKeyMap;
std::vector<std::pair<Path, bool>> MergeRules::s_ExclusionFieldPaths;
std::vector<std::pair<Path, std::tuple<float, float>>> MergeRules::s_ComparisonFieldPaths;
std::vector<ExclusionInfo> MergeRules::s_DiffExclusionFieldPaths;
bool MergeRules::s_PremergeBaseValues = false;
std::vector<Path> MergeRules::defaultPath;
std::vector<Path> MergeRules::defaultDirectPath;
const std::vector<Path> MergeRules::noPaths;

void MergeRules::Initialize() {
    defaultDirectPath.push_back({YAMLScalar::underscore});
    defaultPath.push_back({YAMLScalar::fileID});
}

void MergeRules::AddSequenceUniqueKeys(SequenceType type, const Path& path, const std::vector<Path>& keys) {
    s_ArrayUniqueKeyMap.push_back({type, path, keys});
}

void MergeRules::AddExclusionFieldPath(const Path& path, bool exclude) {
    s_ExclusionFieldPaths.emplace_back(path, !exclude);
}

void MergeRules::AddExclusionIfContainsFieldPath(const Path& path, const std::vector<Path>& fieldPaths,
                                                 bool exclude) {
    s_DiffExclusionFieldPaths.push_back({path, fieldPaths, !exclude});
}

void MergeRules::AddComparisonFieldPath(const Path& path, float relative, float absolute) {
    s_ComparisonFieldPaths.emplace_back(path, std::tuple(relative, absolute));
}

void MergeRules::ResetForTests() {
    s_ArrayUniqueKeyMap.clear();
    s_ExclusionFieldPaths.clear();
    s_ComparisonFieldPaths.clear();
    s_DiffExclusionFieldPaths.clear();
    s_PremergeBaseValues = false;
    defaultPath.clear();
    defaultDirectPath.clear();
}

bool MergeRules::MatchesPath(const Path& pattern, const Path& path) {
    return std::equal(pattern.begin(), pattern.end(), path.begin(), path.end(),
                      [](const YAMLScalar* rule, const YAMLScalar* element) {
                          return rule == YAMLScalar::star || rule == element;
                      });
}

std::size_t MergeRules::LongestPath() {
    std::size_t longest = 1; // that of key lists
    const auto count = [&](const Path& pattern) { longest = std::max(longest, pattern.size()); };
    for (const SequenceInfo& rule : s_ArrayUniqueKeyMap) count(rule.path);
    for (const auto& rule : s_ExclusionFieldPaths) count(rule.first);
    for (const auto& rule : s_ComparisonFieldPaths) count(rule.first);
    for (const ExclusionInfo& rule : s_DiffExclusionFieldPaths) count(rule.path);
    return longest;
}

const std::vector<Path>& MergeRules::SelectKeyPaths(const Path& path) {
    if (path.size() == 1 && path[0] == YAMLScalar::underscore) return defaultDirectPath;
    for (const SequenceInfo& rule : s_ArrayUniqueKeyMap)
        if (MatchesPath(rule.path, path)) return rule.type == SequenceType::Set ? rule.keys : noPaths;
    return defaultPath;
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

bool MergeRules::IsMergeablePath(const Path& path) {
    for (const auto& [pattern, mergeable] : s_ExclusionFieldPaths)
        if (MatchesPath(pattern, path)) return mergeable;
    return true;
}

bool MergeRules::IsMergeablePath(const Path& path, const YAMLNode* node) {
    for (const ExclusionInfo& rule : s_DiffExclusionFieldPaths)
        if (MatchesPath(rule.path, path) && !GetUniqueMappingValues(rule.fieldPaths, node).empty())
            return rule.mergeable;
    return true;
}

} // namespace ovrin_yaml
