#pragma once

#include "Values/Arena.h"
#include "Values/YAMLAlloc.h"
#include "Values/YAMLError.h"
#include "Values/YAMLNode.h"

#include <climits>
#include <vector>

namespace ovrin_yaml {

class YAMLScalar;

using NodeList = std::vector<YAMLNode*, ArenaAllocator<YAMLNode*>>;

/// A list of values, which it owns. An item may be null (a hole) only while operations are being applied;
/// hashing and writing need all items.
class YAMLSequence final : public YAMLNode {
public:
    static constexpr Kind kKind = Kind::Sequence;
    static constexpr std::size_t kMostItems = INT_MAX; // indexes are ints

    explicit YAMLSequence(bool flow = false) : YAMLNode(Kind::Sequence), m_Flow(flow) {}
    YAMLSequence(const YAMLSequence&) = delete;
    YAMLSequence& operator=(const YAMLSequence&) = delete;

    /// The sequence was written in flow style, [...].
    bool m_Flow;
    NodeList m_Items;

    void Append(const YAMLScalar* item);
    /// The item, which may be null. Throws "Cannot get non existing index in YAMLSequence".
    YAMLNode* Get(int index) const;
    /// Replaces the item and returns the old one. Throws "Cannot change non existing index in YAMLSequence".
    YAMLNode* Set(int index, YAMLNode* item);
    /// Appends holes until `count` items are there. Throws "Sequence is too long" beyond kMostItems.
    void GrowTo(std::size_t count);
    /// Closes all holes; what stands behind one moves forward.
    void DropHoles();
    /// A deep copy; holes stay.
    YAMLSequence* StaticClone() const;

    void Free() { YAMLAlloc<YAMLSequence>::free(this); }
    YAMLNode* Clone() const { return StaticClone(); }
    bool Equals(const YAMLNode* other) const;
    bool EqualsExpensive(const YAMLNode* other) const;
    void RebuildHash(bool shallow);
    void ResetForAlloc();
};

inline YAMLSequence* AsSequence(YAMLNode* node) {
    return NodeAs<YAMLSequence>(node);
}
inline const YAMLSequence* AsSequence(const YAMLNode* node) {
    return NodeAs<const YAMLSequence>(node);
}

} // namespace ovrin_yaml
