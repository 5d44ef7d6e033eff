#include "Reading/Fast/Recogniser.h"

#include "Reading/Fast/PlainScan.h"
#include "Values/ObjectTrait.h"

#include <algorithm>
#include <bit>

namespace ovrin_yaml {

Recogniser::Recogniser()
    : m_StateMachine(YAMLScalar::Lookup("AnimatorStateMachine")),
      m_Transitions(YAMLScalar::Lookup("m_StateMachineTransitions")),
      m_KeysThatMatter{YAMLScalar::fileID,          m_Transitions,
                       YAMLScalar::mFather,         YAMLScalar::mPrefabInstance,
                       YAMLScalar::mPrefabInternal, YAMLScalar::mPrefab} {}

/// The pairs of such keys that facts may depend on, a bit each, as far as there are bits.
std::uint64_t Recogniser::PairsThatMatter(KeyLists::List keys, std::size_t count) const {
    std::uint64_t pairs = 0;
    for (std::size_t i = 0; i < std::min(count, kNotedPairs); ++i)
        if (std::find(m_KeysThatMatter.begin(), m_KeysThatMatter.end(), keys[i]) != m_KeysThatMatter.end())
            pairs |= std::uint64_t{1} << i;
    return pairs;
}

/// What a pair tells of the mapping that it stands in. Notes a prefab link, which counts wherever it is.
std::uint32_t Recogniser::FactsOf(const YAMLScalar* key, std::uint32_t value) {
    if (key == YAMLScalar::fileID && value & kScalar) return kHasFileID | (value & kZero ? 0u : kHasTarget);
    if (key == YAMLScalar::mFather) return kHasFather;
    if (key == m_Transitions) return kHasTransitions;
    if (key == YAMLScalar::mPrefabInternal && value & kHasTarget) m_HasPrefabLink = true;
    const bool isLink = key == YAMLScalar::mPrefabInstance || key == YAMLScalar::mPrefabInternal ||
                        key == YAMLScalar::mPrefab;
    return isLink && value & kHasFileID ? std::uint32_t{kHasInstance} : 0;
}

bool Recogniser::CloseMapping(std::size_t mark, bool /*flow*/, std::uint32_t /*line*/,
                              std::size_t headerPairs) {
    const Node* nodes = m_Stack.From(mark);
    const std::size_t count = (m_Stack.Size() - mark) / 2;
    const KeyLists::Known* known = m_KeyLists.Get(
        count, [nodes](std::size_t i) { return nodes[2 * i].scalar; },
        [&](KeyLists::List keys) { return PairsThatMatter(keys, count); });
    if (!known) return false;
    std::uint32_t facts = kMapping;
    const auto take = [&](std::size_t i) { facts |= FactsOf(nodes[2 * i].scalar, nodes[2 * i + 1].facts); };
    for (std::uint64_t pairs = known->note; pairs; pairs &= pairs - 1)
        take(static_cast<std::size_t>(std::countr_zero(pairs)));
    for (std::size_t i = kNotedPairs; i < count; ++i) take(i);
    if (headerPairs) TakeTraits(nodes, count);
    m_Stack.Cut(mark);
    m_Stack.Push(nullptr, facts);
    return true;
}

void Recogniser::CloseSequence(std::size_t mark, bool /*flow*/, std::uint32_t /*line*/) {
    m_Stack.Cut(mark);
    m_Stack.Push(nullptr, 0u);
}

/// Of the object that these pairs are.
void Recogniser::TakeTraits(const Node* nodes, std::size_t count) {
    const auto find = [&](const YAMLScalar* key) -> const Node* {
        for (std::size_t i = 0; i < count; ++i)
            if (nodes[2 * i].scalar == key) return &nodes[2 * i + 1];
        return nullptr;
    };
    std::uint32_t traits = kTraitsKnown;
    if (const Node* machine = find(m_StateMachine); machine && machine->facts & Fact::kHasTransitions)
        traits |= ObjectTrait::kHasTransitions;
    if (m_HasPrefabLink) traits |= kHasPrefabLink;
    const Node* fields = find(YAMLScalar::transform);
    if (!fields) fields = find(YAMLScalar::rectTransform);
    if (fields && fields->facts & kMapping) {
        const bool lacksFather = !(fields->facts & kHasFather);
        traits |= kIsTransform;
        if (lacksFather) traits |= kLacksFather;
        if (lacksFather && !(fields->facts & kHasInstance)) traits |= kLacksInstance;
    }
    m_HasMark = find(YAMLScalar::strippedPrefabPlaceHolderName);
    m_Traits = static_cast<std::uint8_t>(traits);
}

const Recogniser* Recogniser::TakeObject(bool isStripped) {
    const bool hasMark = m_HasMark;
    Clear();
    if (hasMark && !isStripped) throw NotSure();
    return this;
}

void Recogniser::Clear() {
    m_Stack.Cut(0);
    m_HasPrefabLink = m_HasMark = false;
}

} // namespace ovrin_yaml
