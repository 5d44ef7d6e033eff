#pragma once

#include "Reading/Fast/FlowShape.h"
#include "Reading/Fast/KeyLists.h"
#include "Reading/Fast/NodeStack.h"
#include "Values/YAMLScalar.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// Recognises objects from the inside out, as BatchedBuilder builds them: the fast reader works with the one
/// or the other, and is sure of the same documents. Of a value only that stays which the traits of objects
/// depend on; no text is interned but for keys.
///
///     "Transform" open "m_Father" open "fileID" "12" close close
///     stack  Transform | m_Father | fileID | a text
///            Transform | m_Father | has a file id, that isn't 0
///            Transform | has a father
class Recogniser {
public:
    static constexpr std::size_t kReadAhead = FlowShape::kReadAhead;
    static constexpr bool kKnowsShapes = true;

    Recogniser();

    void AddNode(const YAMLScalar* key, std::uint32_t /*hash*/) { m_Stack.Push(key, kScalar); }
    void AddScalar(const YAMLScalar* scalar) {
        m_Stack.Push(scalar, kScalar | (scalar == YAMLScalar::zero ? kZero : 0u));
    }
    void AddText(std::string_view text) { m_Stack.Push(nullptr, kScalar | (text == "0" ? kZero : 0u)); }
    void AddPassingText(std::string_view text) { AddText(text); }
    YAMLScalar* Intern(std::string_view text) { return YAMLScalar::Lookup(text); }

    std::size_t Mark() const { return m_Stack.Size(); }
    /// As BatchedBuilder's. The mapping whose last pairs hold data of a header is the object.
    bool CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t headerPairs = 0);
    void CloseSequence(std::size_t mark, bool flow, std::uint32_t line);

    /// What mappings have in common that differ from the one closed last in their texts alone.
    std::uint32_t FactsOfLast() const { return m_Stack.From(m_Stack.Size() - 1)->facts & ~kHasTarget; }
    /// Adds one of these. `fileID` is the text that it has under that key; empty if it hasn't the key.
    void AddMapping(std::uint32_t facts, std::string_view fileID) {
        m_Stack.Push(nullptr, facts | (fileID.empty() || fileID == "0" ? 0u : kHasTarget));
    }

    /// Itself, which has the traits (ObjectTrait) of the object that was taken last.
    using Object = const Recogniser*;
    /// Not sure of what BatchedBuilder isn't sure of.
    Object TakeObject(bool isStripped);
    std::uint8_t Traits() const { return m_Traits; }
    void InternTexts() {}
    void Clear();

private:
    /// What the traits of an object depend on in a value.
    enum Fact : std::uint32_t {
        kScalar = 1,
        kZero = 2, // the text 0
        kMapping = 4,
        kHasFileID = 8,  // a text
        kHasTarget = 16, // one that isn't 0
        kHasFather = 32,
        kHasInstance = 64,     // a link that an instance is found by
        kHasTransitions = 128, // of a state machine
    };
    struct Node {
        explicit Node(const YAMLScalar* scalar = nullptr, std::uint32_t facts = 0)
            : scalar(scalar), facts(facts) {}

        const YAMLScalar* scalar; // of keys; null where nobody interned the text
        std::uint32_t facts;
    };

    std::uint32_t FactsOf(const YAMLScalar* key, std::uint32_t value);
    void TakeTraits(const Node* nodes, std::size_t count);
    std::uint64_t PairsThatMatter(KeyLists::List keys, std::size_t count) const;

    static constexpr std::size_t kNotedPairs = 64;

    const YAMLScalar* const m_StateMachine;
    const YAMLScalar* const m_Transitions;
    const std::array<const YAMLScalar*, 6> m_KeysThatMatter; // that facts depend on

    NodeStack<Node> m_Stack;
    KeyLists m_KeyLists;
    std::uint8_t m_Traits = 0;
    bool m_HasPrefabLink = false; // the object under way
    bool m_HasMark = false;       // its body or header has the entry that tells of a stripped header
};

} // namespace ovrin_yaml
