#include "SceneTree.h"

namespace ovrin_bench {
namespace {

std::size_t Append(SceneTree& tree, SceneObject object) {
    tree.slots.emplace_back();
    tree.slots.back().object = std::move(object);
    return tree.slots.size() - 1;
}

void AppendFor(SceneTree& tree, Side side, SceneObject object) {
    SceneSlot& slot = tree.slots[Append(tree, std::move(object))];
    slot.inBase = false;
    slot.present[side == Left ? Right : Left] = false;
    slot.claim = side == Left ? SceneSlot::Claim::Left : SceneSlot::Claim::Right;
}

std::int64_t TransformID(const SceneTree& tree, std::size_t entity) {
    return tree.slots[tree.entities[entity].transform].object.id;
}

void MakeComponent(SceneTree& tree, SceneEntity& entity, SceneObject component) {
    AddToList(tree.slots[entity.gameObject].object, "m_Component", ComponentEntry(component.id));
    entity.components.push_back(Append(tree, std::move(component)));
}

void MakeEntity(SceneTree& tree, std::size_t parent, SceneRandom& random, SceneIDs& ids) {
    SceneEntity entity;
    entity.parent = parent;
    bool isRoot = tree.entities.empty();
    std::int64_t father = isRoot ? 0 : TransformID(tree, parent);
    std::int64_t gameObject = ids.Take();
    std::int64_t transform = ids.Take();
    entity.gameObject = Append(tree, MakeGameObject(random, gameObject));
    entity.transform = Append(tree, MakeTransform(random, transform, gameObject, father));
    AddToList(tree.slots[entity.gameObject].object, "m_Component", ComponentEntry(transform));
    if (random.Below(5) < 3) MakeComponent(tree, entity, MakeMeshRenderer(random, ids.Take(), gameObject));
    for (std::uint64_t count = random.Below(3); count > 0; --count)
        MakeComponent(tree, entity, MakeMonoBehaviour(random, ids.Take(), gameObject));
    if (!isRoot) {
        tree.entities[parent].hasChildren = true;
        AddToList(tree.slots[tree.entities[parent].transform].object, "m_Children", Reference(transform));
    }
    tree.entities.push_back(std::move(entity));
}

void MakePrefab(SceneTree& tree, SceneRandom& random, SceneIDs& ids) {
    std::int64_t instance = ids.Take();
    std::int64_t transform = ids.Take();
    Append(tree, MakePrefabInstance(random, instance, TransformID(tree, 0)));
    Append(tree, MakeStrippedTransform(random, transform, instance));
    AddToList(tree.slots[tree.entities[0].transform].object, "m_Children", Reference(transform));
}

} // namespace

SceneObject& SceneSlot::Edit(Side side) {
    if (!inBase) return object;
    if (!edited[side]) edited[side] = object;
    return *edited[side];
}

SceneTree MakeTree(SceneRandom& random, SceneIDs& ids, std::uint64_t mostEntities) {
    SceneTree tree;
    std::uint64_t entities = 1 + random.Below(mostEntities);
    for (std::uint64_t i = 0; i < entities; ++i) MakeEntity(tree, i == 0 ? 0 : random.Below(i), random, ids);
    if (random.Below(3) == 0) MakePrefab(tree, random, ids);
    if (random.Below(8) == 0) {
        std::int64_t first = ids.Take();
        std::int64_t second = ids.Take();
        Append(tree, MakeStateMachine(random, first, second));
        Append(tree, MakeStateMachine(random, second, first));
    }
    return tree;
}

void AddComponent(SceneTree& tree, std::size_t entity, Side side, SceneRandom& random, SceneIDs& ids) {
    SceneSlot& gameObject = tree.slots[tree.entities[entity].gameObject];
    std::int64_t component = ids.Take();
    AddToList(gameObject.Edit(side), "m_Component", ComponentEntry(component));
    AppendFor(tree, side, MakeMonoBehaviour(random, component, gameObject.object.id));
}

void AddChild(SceneTree& tree, std::size_t entity, Side side, SceneRandom& random, SceneIDs& ids) {
    SceneSlot& parent = tree.slots[tree.entities[entity].transform];
    SceneObject gameObject = MakeGameObject(random, ids.Take());
    SceneObject transform = MakeTransform(random, ids.Take(), gameObject.id, parent.object.id);
    AddToList(gameObject, "m_Component", ComponentEntry(transform.id));
    AddToList(parent.Edit(side), "m_Children", Reference(transform.id));
    tree.entities[entity].hasChildren = true;
    AppendFor(tree, side, std::move(gameObject));
    AppendFor(tree, side, std::move(transform));
}

void RemoveLeaf(SceneTree& tree, std::size_t entity, Side side) {
    const SceneEntity& leaf = tree.entities[entity];
    SceneSlot& parent = tree.slots[tree.entities[leaf.parent].transform];
    RemoveFromList(parent.Edit(side), "m_Children", Reference(TransformID(tree, entity)));
    tree.slots[leaf.gameObject].present[side] = false;
    tree.slots[leaf.transform].present[side] = false;
    for (std::size_t component : leaf.components) tree.slots[component].present[side] = false;
}

void MoveToRoot(SceneTree& tree, std::size_t entity, Side side) {
    const SceneEntity& moved = tree.entities[entity];
    SceneValue reference = Reference(TransformID(tree, entity));
    RemoveFromList(tree.slots[tree.entities[moved.parent].transform].Edit(side), "m_Children", reference);
    AddToList(tree.slots[tree.entities[0].transform].Edit(side), "m_Children", reference);
    *tree.slots[moved.transform].Edit(side).fields.Find("m_Father") = Reference(TransformID(tree, 0));
}

} // namespace ovrin_bench
