#pragma once

#include "Checks/Outline.h"

#include "Values/KeyIndex.h"

#include <cstddef>

namespace ovrin {

/// The objects of a scene by their ids. Of several with one id the first counts.
class ObjectTable {
public:
    static constexpr std::size_t kNone = SIZE_MAX;

    /// `outlines` must stay.
    explicit ObjectTable(const Outlines& outlines);

    std::size_t Find(const ovrin_yaml::YAMLScalar* id) const {
        const std::uint32_t found = m_Index.Find(id);
        return found == ovrin_yaml::KeyIndex::kMissing ? kNone : found;
    }
    const ObjectOutline* Get(const ovrin_yaml::YAMLScalar* id) const {
        const std::size_t found = Find(id);
        return found == kNone ? nullptr : &m_Outlines.objects[found];
    }
    const Outlines& All() const { return m_Outlines; }
    const ObjectOutline& At(std::size_t index) const { return m_Outlines.objects[index]; }
    /// Whether an earlier object has the same id.
    bool IsRepeated(std::size_t index) const { return Find(At(index).id) != index; }

private:
    const Outlines& m_Outlines;
    ovrin_yaml::KeyIndex m_Index;
};

/// What an object is, by the first key of its body.
bool IsTransform(const ObjectOutline& object);
bool IsGameObject(const ObjectOutline& object);

/// Whether a field of a reference is there and refers to something.
bool RefersToSomething(const ovrin_yaml::YAMLScalar* target);

} // namespace ovrin
