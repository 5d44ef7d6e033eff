#pragma once

#include "SceneRandom.h"
#include "SceneText.h"

namespace ovrin_bench {

/// Hands out file ids: positive, below 2^31, scattered as an editor scatters them, each once.
class SceneIDs {
public:
    std::int64_t Take();

private:
    std::uint64_t m_Count = 0;
};

/// Random texts and values, as they stand in a scene's fields.
std::string RandomName(SceneRandom& random);
std::string RandomNumber(SceneRandom& random); ///< decimal, with or without a fraction
std::string
RandomNote(SceneRandom& random); ///< short and long texts, some of which need quotes or more than one line
std::string LongID(SceneRandom& random); ///< 19 digits
SceneValue RandomVector(SceneRandom& random);
SceneValue AssetReference(SceneRandom& random); ///< `{fileID: ..., guid: ..., type: ...}`

/// The objects of a scene. A component names its game object; a game object gets its components, and a
/// transform its children, by `AddToList`.
SceneObject MakeGameObject(SceneRandom& random, std::int64_t id);
SceneObject MakeTransform(SceneRandom& random, std::int64_t id, std::int64_t gameObject, std::int64_t father);
SceneObject MakeMeshRenderer(SceneRandom& random, std::int64_t id, std::int64_t gameObject);
SceneObject MakeMonoBehaviour(SceneRandom& random, std::int64_t id, std::int64_t gameObject);
SceneObject MakePrefabInstance(SceneRandom& random, std::int64_t id, std::int64_t parent);
SceneObject MakeStrippedTransform(SceneRandom& random, std::int64_t id, std::int64_t prefabInstance);
SceneObject MakeStateMachine(SceneRandom& random, std::int64_t id, std::int64_t otherMachine);

/// An element of `m_Component`.
SceneValue ComponentEntry(std::int64_t component);

/// Appends to the list field `name` of an object, which must have it.
void AddToList(SceneObject& object, const std::string& name, SceneValue element);
/// Removes the first element equal to `element` from the list field `name`, if there is one.
void RemoveFromList(SceneObject& object, const std::string& name, const SceneValue& element);

} // namespace ovrin_bench
