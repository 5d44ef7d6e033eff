#pragma once

#include "Checks/Outline.h"

#include "Reading/Fast/KeyLists.h"

#include <cstddef>
#include <optional>
#include <string_view>

namespace ovrin {

/// Makes outlines of objects, from the inside out, of what BatchedBuilder makes trees of: the fast reader
/// works with the one or the other. What is neither a reference nor a key is looked at and forgotten.
///
///     "Transform" open "m_Father" open "fileID" "12" close close
///     stack  Transform | m_Father | fileID | 12
///            Transform | m_Father | -> 12                 a reference, in the field below it
///            Transform | {...}                            father 12
class OutlineBuilder {
public:
    /// Nothing is read ahead of what is handed over.
    static constexpr std::size_t kReadAhead = 0;
    /// It needs each pair.
    static constexpr bool kKnowsShapes = false;

    OutlineBuilder();

    void AddNode(const ovrin_yaml::YAMLScalar* scalar, std::uint32_t /*hash*/) { AddScalar(scalar); }
    void AddScalar(const ovrin_yaml::YAMLScalar* scalar) {
        m_Stack.push_back({scalar, scalar->Value(), Kind::Text});
    }
    void AddText(std::string_view text) { m_Stack.push_back({nullptr, text, Kind::Text}); }
    void AddPassingText(std::string_view text) { AddScalar(ovrin_yaml::YAMLScalar::Lookup(text)); }
    ovrin_yaml::YAMLScalar* Intern(std::string_view text) { return ovrin_yaml::YAMLScalar::Lookup(text); }

    /// Opens a container; what is added from now on belongs to it.
    std::size_t Mark() {
        m_Open.push_back(m_Stack.size());
        return m_Stack.size();
    }
    /// Closes a mapping. The object itself, which nobody opened, is closed last; its last `headerPairs` pairs
    /// hold data of its header. A repeated key is noted, and false returned, unless it is one of transitions,
    /// where that is usual: only a tree tells whether its values differ.
    bool CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t headerPairs = 0);
    void CloseSequence(std::size_t mark, bool flow, std::uint32_t line);

    /// Valid up to the next one; TakeOutlines has it, too.
    using Object = const ObjectOutline*;
    Object TakeObject(bool isStripped);
    void InternTexts() {}
    /// Forgets the object under way.
    void Clear();

    /// All objects so far.
    Outlines TakeOutlines();

private:
    enum class Kind : std::uint8_t { Text, Container, Reference };
    struct Node {
        const ovrin_yaml::YAMLScalar* scalar; // of keys; null where nobody interned the text
        std::string_view text;                // of a reference its target
        Kind kind;
    };

    const ovrin_yaml::YAMLScalar* FieldAround(std::size_t mark) const;
    bool IsOfTransitions(std::size_t mark) const;
    bool IsReference(std::size_t mark, std::size_t pairs) const;
    void Collapse(std::size_t mark, const Node& node);
    void NoteReference(std::string_view target, std::size_t mark, std::uint32_t line);
    void NoteRepeatedKeys(std::size_t mark, std::size_t pairs, std::uint32_t line);
    void NoteFields(std::size_t mark, std::size_t pairs);
    void NoteHeader(std::size_t mark, std::size_t pairs, std::size_t headerPairs);

    const ovrin_yaml::YAMLScalar* const m_Children;
    const ovrin_yaml::YAMLScalar* const m_StateMachine;
    const ovrin_yaml::YAMLScalar* const m_Transitions;

    std::vector<Node> m_Stack;
    std::vector<std::size_t> m_Open; // where the containers that are open begin on the stack
    ovrin_yaml::KeyLists m_KeyLists;
    ObjectOutline m_Object; // under way
    bool m_HasMark = false; // its body has the entry that tells of a stripped header
    Outlines m_Outlines;
};

} // namespace ovrin
