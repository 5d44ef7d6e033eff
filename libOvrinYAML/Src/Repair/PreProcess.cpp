#include "Repair/PreProcess.h"

#include "Repair/ObjectAccess.h"
#include "Repair/ObjectTraits.h"

namespace ovrin_yaml {

namespace {

[[noreturn]] void Fail(const char* fault, const YAMLScalar& key) {
    throw YAMLError(fault + std::string(key.Value()));
}

/// Calls replace(key, transitions) for each state machine that has transitions, puts its result in their
/// place, and calls replaced(object).
template <class Replace, class Replaced>
void ReplaceTransitions(YAMLMapping& root, const TaskRunner& run, const Replace& replace,
                        const Replaced& replaced) {
    const YAMLScalar* const machine = YAMLScalar::Lookup("AnimatorStateMachine");
    const YAMLScalar* const key = YAMLScalar::Lookup("m_StateMachineTransitions");
    const auto hadTransitions = [](const YAMLMapping& object) {
        return (object.Traits() & kHasTransitions) != 0;
    };
    const auto find = [](const YAMLScalar*, const YAMLNode* value) {
        const YAMLMapping* object = AsMapping(value);
        return object ? TransitionsOf(*object) : nullptr;
    };
    ForEachObject(root, run, hadTransitions, find, [&](const YAMLScalar* id, const YAMLNode* value) {
        const YAMLNode* transitions = find(id, value);
        if (!transitions) return;
        YAMLNode* replacement = replace(*key, transitions);
        YAMLMapping& editable = Editable(root, id);
        ToMapping(editable.GetRef(machine)).Change(key, replacement);
        replaced(editable);
    });
}

YAMLNode* ToList(const YAMLScalar& key, const YAMLNode* transitions) {
    const YAMLMapping* mapping = AsMapping(transitions);
    if (!mapping) Fail("Expected key to point to yaml mapping: ", key);
    return mapping->ToSequence();
}

YAMLNode* ToRepeatedKeys(const YAMLScalar& key, const YAMLNode* transitions) {
    const YAMLSequence* list = AsSequence(transitions);
    if (!list) Fail("Expected key to point to yaml sequence: ", key);
    YAMLMapping* mapping = YAMLAlloc<YAMLMapping>::create(list->m_Flow);
    for (const YAMLNode* item : list->m_Items) {
        if (!item) continue;
        const YAMLMapping* pair = AsMapping(item);
        if (!pair || pair->Size() != 1) Fail("Expected size of one for key: ", key);
        mapping->Append(pair->begin()->key, pair->First()->Clone());
    }
    return mapping;
}

} // namespace

void PreProcess(YAMLMapping& root, const TaskRunner& run) {
    ReplaceTransitions(root, run, ToList, [](YAMLMapping& object) { object.RebuildHash(false); });
}

void RestoreRepeatedKeys(YAMLMapping& root, const TaskRunner& run) {
    ReplaceTransitions(root, run, ToRepeatedKeys, [](YAMLMapping&) {});
}

} // namespace ovrin_yaml
