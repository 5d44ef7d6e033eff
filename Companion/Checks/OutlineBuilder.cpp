#include "Checks/OutlineBuilder.h"

#include "Reading/Fast/PlainScan.h"
#include "Values/OvrinObjects.h"

#include <unordered_set>
#include <utility>

namespace ovrin {

using ovrin_yaml::YAMLScalar;

OutlineBuilder::OutlineBuilder()
    : m_Children(YAMLScalar::Lookup("m_Children")),
      m_StateMachine(YAMLScalar::Lookup("AnimatorStateMachine")),
      m_Transitions(YAMLScalar::Lookup("m_StateMachineTransitions")) {}

/// The field of the object's class that a container which begins at `mark` stands in: the key in front of the
/// container one level below the class.
const YAMLScalar* OutlineBuilder::FieldAround(std::size_t mark) const {
    if (m_Open.size() < 2) return nullptr;
    const std::size_t field = m_Open.size() == 2 ? mark : m_Open[1];
    return m_Stack[field - 1].scalar;
}

bool OutlineBuilder::IsOfTransitions(std::size_t mark) const {
    return m_Open.size() == 2 && FieldAround(mark) == m_Transitions &&
           m_Stack[m_Open[0] - 1].scalar == m_StateMachine;
}

/// A value of the stack is the one of the only key, fileID.
bool OutlineBuilder::IsReference(std::size_t mark, std::size_t pairs) const {
    return pairs == 1 && m_Stack[mark].scalar == YAMLScalar::fileID && m_Stack[mark + 1].kind == Kind::Text;
}

void OutlineBuilder::Collapse(std::size_t mark, const Node& node) {
    m_Stack.resize(mark);
    m_Stack.push_back(node);
    m_Open.pop_back();
}

void OutlineBuilder::NoteReference(std::string_view target, std::size_t mark, std::uint32_t line) {
    if (target.empty() || target == "0") return;
    m_Outlines.references.push_back({YAMLScalar::Lookup(target), FieldAround(mark), line});
    ++m_Object.references;
}

void OutlineBuilder::NoteRepeatedKeys(std::size_t mark, std::size_t pairs, std::uint32_t line) {
    std::unordered_set<const YAMLScalar*> seen, told;
    for (std::size_t i = 0; i < pairs; ++i) {
        const YAMLScalar* key = m_Stack[mark + 2 * i].scalar;
        if (seen.insert(key).second || !told.insert(key).second) continue;
        m_Outlines.repeatedKeys.push_back({key, line});
        ++m_Object.repeatedKeys;
    }
}

/// Of the body of a class.
void OutlineBuilder::NoteFields(std::size_t mark, std::size_t pairs) {
    for (std::size_t i = 0; i < pairs; ++i) {
        const YAMLScalar* key = m_Stack[mark + 2 * i].scalar;
        const Node& value = m_Stack[mark + 2 * i + 1];
        const bool isReference = value.kind == Kind::Reference;
        if (key == YAMLScalar::mGameObject && isReference)
            m_Object.gameObject = YAMLScalar::Lookup(value.text);
        if (key == YAMLScalar::mFather && isReference) m_Object.father = YAMLScalar::Lookup(value.text);
        m_Object.hasChildren |= key == m_Children;
        m_Object.hasComponents |= key == YAMLScalar::mComponent;
    }
}

/// Of the object itself.
void OutlineBuilder::NoteHeader(std::size_t mark, std::size_t pairs, std::size_t headerPairs) {
    const std::size_t body = pairs - headerPairs;
    if (body) m_Object.className = m_Stack[mark].scalar;
    for (std::size_t i = 0; i < pairs; ++i) {
        const YAMLScalar* key = m_Stack[mark + 2 * i].scalar;
        const std::string_view value = m_Stack[mark + 2 * i + 1].text;
        if (i < body) m_HasMark |= key == YAMLScalar::strippedPrefabPlaceHolderName;
        // Of a body's own entry that says the same a tree has no other.
        if (key == YAMLScalar::fileIDPlaceHolderName) m_Object.id = YAMLScalar::Lookup(value);
        if (key == YAMLScalar::classIDPlaceHolderName) m_Object.classID = YAMLScalar::Lookup(value);
    }
}

bool OutlineBuilder::CloseMapping(std::size_t mark, bool /*flow*/, std::uint32_t line,
                                  std::size_t headerPairs) {
    const std::size_t pairs = (m_Stack.size() - mark) / 2;
    const auto keyAt = [&](std::size_t i) { return m_Stack[mark + 2 * i].scalar; };
    const bool repeatsKey = pairs > 1 && !m_KeyLists.Get(pairs, keyAt);
    const bool isUsual = !repeatsKey || IsOfTransitions(mark);
    m_Object.hasRepeatedTransitions |= repeatsKey && isUsual;
    if (!isUsual) NoteRepeatedKeys(mark, pairs, line);
    if (m_Open.empty()) {
        NoteHeader(mark, pairs, headerPairs);
        m_Stack.clear();
    } else if (IsReference(mark, pairs)) {
        const Node target = {nullptr, m_Stack[mark + 1].text, Kind::Reference};
        NoteReference(target.text, mark, line);
        Collapse(mark, target);
    } else {
        if (m_Open.size() == 1) NoteFields(mark, pairs);
        Collapse(mark, {nullptr, {}, Kind::Container});
    }
    return isUsual;
}

void OutlineBuilder::CloseSequence(std::size_t mark, bool /*flow*/, std::uint32_t /*line*/) {
    Collapse(mark, {nullptr, {}, Kind::Container});
}

/// A body's own entry would be taken for the header's.
OutlineBuilder::Object OutlineBuilder::TakeObject(bool isStripped) {
    if (m_HasMark && !isStripped) throw ovrin_yaml::NotSure();
    m_Object.isStripped = isStripped;
    m_Object.firstReference = m_Outlines.references.size() - m_Object.references;
    m_Outlines.objects.push_back(std::exchange(m_Object, {}));
    m_HasMark = false;
    return &m_Outlines.objects.back();
}

void OutlineBuilder::Clear() {
    m_Stack.clear();
    m_Open.clear();
    m_Outlines.references.resize(m_Outlines.references.size() - m_Object.references);
    m_Outlines.repeatedKeys.resize(m_Outlines.repeatedKeys.size() - m_Object.repeatedKeys);
    m_Object = {};
    m_HasMark = false;
}

Outlines OutlineBuilder::TakeOutlines() {
    return std::exchange(m_Outlines, {});
}

} // namespace ovrin
