#pragma once

#include "Support/Documents.h"

#include <random>

/// Random bodies of objects and random edits of them.
namespace random_trees {

using namespace documents;

/// What the editor leaves out, since the rules of diff and merge lose it on purpose.
struct EditLimits {
    bool movesKeys = true;     // below the root; always beside a change of a value there
    bool movesElements = true; // in lists
    bool movesRootKeys = true;
};

/// Every value that is made is new, so that no two elements of a list are equal by chance. Lists may be
/// empty, mappings not: an empty list and an empty mapping have one hash and count as equal.
class RandomTrees {
public:
    explicit RandomTrees(unsigned seed) : m_Random(seed) {}

    /// A mapping in block style, hashed.
    YAMLMapping* Body();
    /// A copy with some edits, hashed.
    YAMLMapping* Edited(const YAMLMapping* source, const EditLimits& limits);

private:
    std::size_t Below(std::size_t limit) { return m_Random() % limit; }
    const YAMLScalar* FreshKey();
    YAMLNode* FreshScalar();
    YAMLNode* FreshValue(int depth);
    YAMLNode* FreshList(int depth);
    YAMLNode* FreshElement(int depth, bool keyed);
    void EditMapping(YAMLMapping& mapping, const EditLimits& limits, bool isRoot);
    void EditList(YAMLSequence& list, const EditLimits& limits);
    YAMLNode* EditedValue(YAMLNode* value, const EditLimits& limits);
    void MoveKeys(YAMLMapping& mapping);

    std::mt19937 m_Random;
    int m_Fresh = 0;
};

} // namespace random_trees
