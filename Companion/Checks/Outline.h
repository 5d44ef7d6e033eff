#pragma once

#include "Values/YAMLScalar.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace ovrin {

/// A reference to another object of the same file: a mapping of a fileID alone, that isn't 0.
struct LocalReference {
    const ovrin_yaml::YAMLScalar* target;
    const ovrin_yaml::YAMLScalar* field; ///< of the object's class, wherever inside; null if it isn't in one
    std::uint32_t line;                  ///< where it begins
};

/// A mapping that has a key twice.
struct RepeatedKey {
    const ovrin_yaml::YAMLScalar* key;
    std::uint32_t line; ///< where the mapping begins
};

/// What an object says of others, and what is odd about itself: all that the checks want to know. A few bytes
/// where a tree takes hundreds.
struct ObjectOutline {
    const ovrin_yaml::YAMLScalar* id = nullptr;
    const ovrin_yaml::YAMLScalar* classID = nullptr;
    const ovrin_yaml::YAMLScalar* className = nullptr;  ///< the first key
    const ovrin_yaml::YAMLScalar* gameObject = nullptr; ///< of m_GameObject, 0 included; null without one
    const ovrin_yaml::YAMLScalar* father = nullptr;     ///< of m_Father in the same way
    bool isStripped = false;
    bool hasChildren = false;            ///< has the field m_Children
    bool hasRepeatedTransitions = false; ///< transitions with a key twice, as usual
    bool hasComponents = false;          ///< has the field m_Component
    bool isAsWritten = true; ///< false for the first, at least, that would be written in another way
    std::uint32_t references = 0, repeatedKeys = 0; ///< how many of them, in the lists of their outlines
    std::size_t firstReference = 0;                 ///< where they begin there
    std::size_t begin = 0;                          ///< of its document, in the text
};

/// Objects in their order, and in the same order what each of them has. Lines count from that of the object's
/// document, which is 0.
struct Outlines {
    std::vector<ObjectOutline> objects;
    std::vector<LocalReference> references;
    std::vector<RepeatedKey> repeatedKeys;

    /// Those of an object.
    std::span<const LocalReference> ReferencesOf(const ObjectOutline& object) const {
        return std::span(references).subspan(object.firstReference, object.references);
    }
    /// Puts `others` behind these.
    void Append(Outlines others);
};

} // namespace ovrin
