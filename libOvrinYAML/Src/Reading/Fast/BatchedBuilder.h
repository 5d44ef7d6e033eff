#pragma once

#include "Reading/Fast/KeyLists.h"
#include "Reading/Fast/NodeStack.h"
#include "Reading/Fast/ShortTextCache.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// Builds value trees without repeated keys from the inside out, as a reader meets their parts, and interns
/// their texts many at a time.
///
/// Nodes that wait for their container stand on one stack; closing a container takes its part of the stack,
/// so that each container is made once, with its final size.
///
/// Short texts that were met lately are found in a cache of the builder's own. Any other text is late: only
/// its hash is known at first, which is all that the hash of a container needs, and the memory of its scalar
/// is asked for. The scalar itself comes when enough texts wait, into the place where its node stands by
/// then.
///
///     "m_X" open "fileID" "12" close      stack  m_X | fileID | late 1, hash of "12"
///                                                m_X | {fileID: null}     late 1 -> place of the null
///     InternTexts                                m_X | {fileID: 12}
class BatchedBuilder {
public:
    // Texts must stay where they are until they are interned, and kReadAhead bytes from their start on must
    // be readable.

    static constexpr std::size_t kReadAhead = ShortText::kLongest;
    /// It needs each pair.
    static constexpr bool kKnowsShapes = false;

    void AddNode(YAMLNode* node, std::uint32_t hash) { m_Stack.Push(node, hash); }
    void AddScalar(YAMLScalar* scalar) { AddNode(scalar, scalar->m_Hash); }
    void AddText(std::string_view text) {
        if (text.size() <= ShortText::kLongest) {
            const ShortText packed = ShortText::Pack(text);
            ShortTextCache::Entry& entry = m_ShortTexts.At(packed);
            if (!entry.Holds(packed))
                AddNewShort(text, packed, entry);
            else if (entry.scalar)
                AddNode(entry.scalar, entry.hash);
            else
                AddLate(text, entry.hash, entry);
        } else {
            AddLong(text);
        }
    }
    /// A text that need not stay.
    void AddPassingText(std::string_view text) { AddScalar(YAMLScalar::Lookup(text)); }
    /// The scalar of a text that may be read as the others, at once.
    YAMLScalar* Intern(std::string_view text);

    /// Where the stack ends: what is added from now on belongs to the container closed with it.
    std::size_t Mark() const { return m_Stack.Size(); }
    /// Makes a mapping of the keys and values behind the mark, the last `unhashed` pairs left out of its
    /// hash. Keys must be interned scalars. False if one of them stands there twice.
    bool CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t unhashed = 0);
    void CloseSequence(std::size_t mark, bool flow, std::uint32_t line);

    /// Owned by whoever takes it. Its late scalars are null until they are interned. No mapping in it has a
    /// key twice.
    using Object = YAMLMapping*;
    /// Takes the object that is the only node on the stack. Not sure of one whose body has the entry that
    /// tells of a stripped header, which would be taken for the header's.
    Object TakeObject(bool isStripped);
    /// Completes all trees taken so far.
    void InternTexts();
    /// Forgets the tree under way.
    void Clear();

private:
    /// Made where it stands: one that was put together elsewhere would be copied as a whole, which has to
    /// wait for the stores of its parts.
    struct Node {
        explicit Node(YAMLNode* node = nullptr, std::uint32_t hash = 0, std::uint32_t late = 0)
            : node(node), hash(hash), late(late) {}

        YAMLNode* node;
        std::uint32_t hash;
        std::uint32_t late; // place in m_Late, or 0
    };
    struct LateText {
        const char* text;
        std::uint32_t length;
        std::uint32_t hash;
        std::uint32_t index;          // on the stack
        ShortTextCache::Entry* entry; // to be completed if it is still the text's
        YAMLNode** place;             // null while the node is on the stack
    };
    static constexpr std::size_t kMostLate = 256;

    YAMLNode* TakeRoot();
    void AddNewShort(std::string_view text, const ShortText& packed, ShortTextCache::Entry& entry);
    void AddLong(std::string_view text);
    void AddLate(std::string_view text, std::uint32_t hash, ShortTextCache::Entry& entry);
    void SetPlace(const Node& node, YAMLNode** place) { m_Late[node.late].place = place; }

    NodeStack<Node> m_Stack;
    std::size_t m_LateCount = 0;
    std::size_t m_FirstLate = 0; // of the tree under way
    // The first is nobody's: which texts are late is hard to foretell, so that writing where nobody reads is
    // cheaper than a branch. For the same reason long texts have an entry.
    std::array<LateText, kMostLate + 1> m_Late;
    ShortTextCache::Entry m_LongTexts;
    ShortTextCache m_ShortTexts;
    KeyLists m_KeyLists;
};

} // namespace ovrin_yaml
