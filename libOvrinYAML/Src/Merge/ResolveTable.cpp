#include "Merge/ResolveTable.h"

#include <algorithm>
#include <functional>

namespace ovrin_yaml {

std::size_t ResolveTable::PathHash::operator()(const Path& path) const {
    std::size_t hash = path.size();
    for (const YAMLScalar* element : path) hash = hash * 31 + std::hash<const YAMLScalar*>()(element);
    return hash;
}

ResolveTable::Shape& ResolveTable::ShapeOf(const Path& pattern) {
    std::vector<bool> isStar;
    for (const YAMLScalar* element : pattern) isStar.push_back(element == YAMLScalar::star);
    if (m_ShapesByLength.size() <= pattern.size()) m_ShapesByLength.resize(pattern.size() + 1);
    auto& shapes = m_ShapesByLength[pattern.size()];
    const auto known = std::find_if(shapes.begin(), shapes.end(),
                                    [&](const Shape& shape) { return shape.isStar == isStar; });
    if (known != shapes.end()) return *known;
    return shapes.emplace_back(Shape{std::move(isStar), {}});
}

void ResolveTable::Set(const std::vector<RecordResolve>& resolves) {
    m_Resolves = resolves;
    m_ShapesByLength.clear();
    for (std::size_t i = 0; i < resolves.size(); ++i)
        ShapeOf(resolves[i].path).firstResolve.try_emplace(resolves[i].path, i);
}

void ResolveTable::ForEachMatch(const Path& path, const std::function<void(std::size_t)>& visit) const {
    if (path.size() >= m_ShapesByLength.size()) return;
    const bool inKeyList = !path.empty() && path.front() == YAMLScalar::underscore;
    Path masked;
    for (const Shape& shape : m_ShapesByLength[path.size()]) {
        if (inKeyList && shape.isStar.front()) continue;
        masked = path;
        for (std::size_t i = 0; i < masked.size(); ++i)
            if (shape.isStar[i]) masked[i] = YAMLScalar::star;
        const auto found = shape.firstResolve.find(masked);
        if (found != shape.firstResolve.end()) visit(found->second);
    }
}

std::optional<MergeResolve> ResolveTable::Find(const Path& path) const {
    std::size_t first = m_Resolves.size();
    ForEachMatch(path, [&](std::size_t number) { first = std::min(first, number); });
    if (first == m_Resolves.size()) return std::nullopt;
    return m_Resolves[first].resolve;
}

} // namespace ovrin_yaml
