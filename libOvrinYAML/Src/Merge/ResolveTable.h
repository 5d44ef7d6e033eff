#pragma once

#include "Merge/MergeResolve.h"
#include "Values/YAMLScalar.h"

#include <cstddef>
#include <functional>
#include <optional>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {

/// A decision made before the merge: what is wanted at the paths that a pattern matches. In the pattern "*"
/// stands for any one element.
struct RecordResolve {
    Path path;
    MergeResolve resolve;
};

/// Finds the first decision, in the order in which they were given, whose pattern matches a path.
///
/// Patterns of one length with stars at the same places form a group; a path is looked up once in each group
/// of its length, with its own elements replaced by stars at these places. So the cost depends on the number
/// of shapes, not of decisions.
class ResolveTable {
public:
    void Set(const std::vector<RecordResolve>& resolves);
    const std::vector<RecordResolve>& All() const { return m_Resolves; }

    /// The decision's handling; nothing if there is none. A pattern reaches into the key lists of mappings,
    /// paths that begin with "_", only if it begins with "_" itself: a star must not tear them apart.
    std::optional<MergeResolve> Find(const Path& path) const;

    /// Calls visit(number) for all decisions that match a path, in no order; of those with one pattern for
    /// the first alone. The number is that among All().
    void ForEachMatch(const Path& path, const std::function<void(std::size_t)>& visit) const;

private:
    struct PathHash {
        std::size_t operator()(const Path& path) const;
    };
    struct Shape {
        std::vector<bool> isStar;
        std::unordered_map<Path, std::size_t, PathHash> firstResolve; // indexes in m_Resolves
    };

    Shape& ShapeOf(const Path& pattern);

    std::vector<RecordResolve> m_Resolves;
    std::vector<std::vector<Shape>> m_ShapesByLength;
};

} // namespace ovrin_yaml
