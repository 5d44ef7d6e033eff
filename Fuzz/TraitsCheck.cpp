#include "TraitsCheck.h"

#include "Values/ObjectTrait.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <cstdint>
#include <string_view>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// The value of a key by a plain search.
const YAMLNode* Search(const YAMLNode* node, std::string_view key) {
    const YAMLMapping* mapping = AsMapping(node);
    if (!mapping) return nullptr;
    for (const YAMLMapping::Entry entry : mapping->RawEntries())
        if (entry.key && entry.key->Value() == key) return entry.value;
    return nullptr;
}

bool HasLinkBelow(std::string_view key, const YAMLNode& node) {
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        const YAMLScalar* target = AsScalar(Search(mapping, "fileID"));
        bool found = key == "m_PrefabInternal" && target && target->Value() != "0";
        for (const YAMLMapping::Entry entry : mapping->RawEntries())
            found = found || (entry.key && HasLinkBelow(entry.key->Value(), *entry.value));
        return found;
    }
    bool found = false;
    if (const YAMLSequence* sequence = AsSequence(&node))
        for (const YAMLNode* item : sequence->m_Items) found = found || HasLinkBelow("", *item);
    return found;
}

/// The traits of an object, found by looking at everything each time.
std::uint8_t PlainTraits(const YAMLMapping& object) {
    const YAMLNode* fields = Search(&object, "Transform");
    if (!fields) fields = Search(&object, "RectTransform");
    int traits = kTraitsKnown;
    if (Search(Search(&object, "AnimatorStateMachine"), "m_StateMachineTransitions"))
        traits |= kHasTransitions;
    if (HasLinkBelow("", object)) traits |= kHasPrefabLink;
    if (AsMapping(fields)) traits |= kIsTransform;
    if (AsMapping(fields) && !Search(fields, "m_Father")) {
        traits |= kLacksFather | kLacksInstance;
        for (const char* link : {"m_PrefabInstance", "m_PrefabInternal", "m_Prefab"})
            if (AsScalar(Search(Search(fields, link), "fileID"))) traits &= ~kLacksInstance;
    }
    return static_cast<std::uint8_t>(traits);
}

} // namespace

std::string CheckTraits(const YAMLMapping& root) {
    for (const YAMLMapping::Entry entry : root.RawEntries()) {
        const YAMLMapping* object = entry.key ? AsMapping(entry.value) : nullptr;
        if (object && object->Traits() && object->Traits() != PlainTraits(*object))
            return "traits of " + std::string(entry.key->Value()) + ": " + std::to_string(object->Traits());
    }
    return "";
}

} // namespace ovrin_fuzz
