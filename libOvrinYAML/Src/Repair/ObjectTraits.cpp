#include "Repair/ObjectTraits.h"

#include "Repair/ObjectAccess.h"

namespace ovrin_yaml {

namespace {

bool HasPrefabLink(const YAMLScalar* key, const YAMLNode* node) {
    if (const YAMLMapping* mapping = AsMapping(node)) {
        if (IsPrefabLink(key, *mapping)) return true;
        for (const YAMLMapping::Entry entry : *mapping)
            if (!AsScalar(entry.value) && HasPrefabLink(entry.key, entry.value)) return true;
    } else if (const YAMLSequence* sequence = AsSequence(node)) {
        for (const YAMLNode* item : sequence->m_Items)
            if (HasPrefabLink(nullptr, item)) return true;
    }
    return false;
}

} // namespace

bool IsPrefabLink(const YAMLScalar* key, const YAMLMapping& mapping) {
    if (key != YAMLScalar::mPrefabInternal) return false;
    const YAMLScalar* target = AsScalar(mapping.Get(YAMLScalar::fileID));
    return target && target != YAMLScalar::zero;
}

const YAMLScalar* InstanceOf(const YAMLMapping& fields) {
    for (const YAMLScalar* key :
         {YAMLScalar::mPrefabInstance, YAMLScalar::mPrefabInternal, YAMLScalar::mPrefab})
        if (const YAMLScalar* link = GetMappingPath(&fields, {key, YAMLScalar::fileID})) return link;
    return nullptr;
}

const YAMLNode* TransitionsOf(const YAMLMapping& object) {
    static const YAMLScalar* const machine = YAMLScalar::Lookup("AnimatorStateMachine");
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_StateMachineTransitions");
    const YAMLMapping* fields = AsMapping(object.Get(machine));
    return fields ? fields->Get(key) : nullptr;
}

std::uint8_t InspectObject(const YAMLMapping& object) {
    std::uint8_t traits = kTraitsKnown;
    if (TransitionsOf(object)) traits |= kHasTransitions;
    if (HasPrefabLink(nullptr, &object)) traits |= kHasPrefabLink;
    if (const YAMLMapping* fields = GetTransform(&object).fields) {
        traits |= kIsTransform;
        const bool lacksFather = !fields->HasKey(YAMLScalar::mFather);
        if (lacksFather) traits |= kLacksFather;
        if (lacksFather && !InstanceOf(*fields)) traits |= kLacksInstance;
    }
    return traits;
}

} // namespace ovrin_yaml
