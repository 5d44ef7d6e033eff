#pragma once

#include "SceneTree.h"

namespace ovrin_bench {

/// A scalar that both sides changed, to different texts.
struct SceneConflict {
    std::int64_t object = 0;
    std::string className;
    std::string property; ///< the path below the class name, joined by "."
};

/// Edits of people in a tree. Shares are parts of a million. Whatever the calls and their order, left and
/// right never meet, except in the conflicts asked for.
class SceneEditor {
public:
    SceneEditor(SceneTree& tree, SceneRandom& random, SceneIDs& ids)
        : m_Tree(tree), m_Random(random), m_IDs(ids) {}

    /// Makes a conflict in one object that no edit has touched. Nothing if the slot doesn't allow one.
    std::optional<SceneConflict> MakeConflict(std::size_t slot);

    /// Adds, removes and moves whole entities and components, starting from a share of the entities.
    void EditStructure(Side side, std::uint64_t share);

    /// Changes one to three fields in a share of the objects on each side; an object that both sides change
    /// is changed in different fields.
    void EditFieldsApart(std::uint64_t leftShare, std::uint64_t rightShare);

    /// Changes fields on both sides, different ones, in a share of the objects.
    void EditFieldsTogether(std::uint64_t share);

private:
    bool Claim(const std::vector<std::size_t>& slots, Side side);
    void RestructureEntity(std::size_t entity, Side side);
    void EditSlot(SceneSlot& slot, bool left, bool right);
    bool EditField(SceneObject& object, const std::vector<std::size_t>& fields);

    SceneTree& m_Tree;
    SceneRandom& m_Random;
    SceneIDs& m_IDs;
    std::vector<bool> m_Restructured; // by entity: has been added to, removed or moved
};

/// One list edited by one side: a third of `share` of its elements goes, a third gets a neighbour made by
/// `newElement`, a third moves some places down.
template <class NewElement>
std::vector<SceneValue> EditedList(const std::vector<SceneValue>& base, std::uint64_t share,
                                   SceneRandom& random, NewElement newElement) {
    constexpr std::uint64_t farthestMove = 1000;
    std::vector<std::vector<SceneValue>> landing(
        farthestMove); // ring: what lands behind the elements to come
    std::vector<SceneValue> edited;
    edited.reserve(base.size());
    for (std::size_t i = 0; i < base.size(); ++i) {
        std::uint64_t edit = random.Chance(share) ? random.Below(3) : 3;
        if (edit == 2) landing[(i + 1 + random.Below(farthestMove - 1)) % farthestMove].push_back(base[i]);
        if (edit == 1 || edit == 3) edited.push_back(base[i]);
        if (edit == 1) edited.push_back(newElement());
        for (SceneValue& moved : landing[i % farthestMove]) edited.push_back(std::move(moved));
        landing[i % farthestMove].clear();
    }
    for (std::size_t i = 0; i < farthestMove; ++i)
        for (SceneValue& moved : landing[(base.size() + i) % farthestMove])
            edited.push_back(std::move(moved));
    return edited;
}

} // namespace ovrin_bench
