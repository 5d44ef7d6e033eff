#pragma once

#include "Document/ArenaArray.h"
#include "Document/KeyIndex.h"
#include "Document/YAMLAlloc.h"
#include "Document/YAMLError.h"
#include "Document/YAMLNode.h"

#include <cstddef>
#include <span>
#include <string_view>
#include <vector>

namespace ovrin_yaml {

class YAMLScalar;
class YAMLSequence;

/// An ordered mapping from scalars to values. It owns its values, not its keys.
///
/// Two states, of which a mapping leaves the first at most once:
///  - normal: no key twice, no value null; iteration is in document order;
///  - duplicate: a key came twice with unequal values. All pairs are kept in document order, repeated keys
///    included, so that the mapping can be converted (ToSequence) or written as it was read. Everything else
///    throws YAMLError "Cannot perform this operation on a YAML file with duplicate keys".
/// No operation that throws has changed the mapping. None but RebuildHash touches m_Hash.
class YAMLMapping final : public YAMLNode {
public:
    static constexpr Kind kKind = Kind::Mapping;

    struct Entry {
        const YAMLScalar* key; // null: a pair that was removed, passed over by iteration
        YAMLNode* value;
    };

    /// Iterates over the pairs in document order. The mapping must not gain or lose keys meanwhile.
    class Iterator {
    public:
        Iterator(const Entry* position, const Entry* end) : m_Position(position), m_End(end) {
            SkipRemoved();
        }
        const Entry& operator*() const { return *m_Position; }
        const Entry* operator->() const { return m_Position; }
        Iterator& operator++() {
            ++m_Position;
            SkipRemoved();
            return *this;
        }
        bool operator==(const Iterator& other) const { return m_Position == other.m_Position; }

    private:
        void SkipRemoved() {
            while (m_Position != m_End && !m_Position->key) ++m_Position;
        }

        const Entry* m_Position;
        const Entry* m_End;
    };

    explicit YAMLMapping(bool flow = false) : YAMLNode(Kind::Mapping), m_Flow(flow) {}
    /// With room for `capacity` pairs in `memory`, which must come from the arena.
    YAMLMapping(bool flow, Entry* memory, std::size_t capacity)
        : YAMLNode(Kind::Mapping), m_Flow(flow), m_Entries(memory, capacity) {}
    YAMLMapping(const YAMLMapping&) = delete;
    YAMLMapping& operator=(const YAMLMapping&) = delete;
    ~YAMLMapping();

    /// The mapping was written in flow style, {...}.
    bool m_Flow;
    /// What an inspector found in this object when it was read (ReaderOptions::inspect); 0: nobody looked, or
    /// the object was changed since.
    std::uint8_t m_Traits = 0;
    /// The mapping is an object that several trees hold: it is never freed, and copied before it is changed.
    bool m_IsShared = false;

private:
    // Stands here to fill a gap: there are millions of mappings.
    std::uint32_t m_HasDuplicates : 1 = 0;
    std::uint32_t m_Removed : 31 = 0; // pairs in m_Entries whose key is null; only where there is an index

public:
    /// A new block or flow mapping with room for `capacity` pairs, which stand right behind it in memory.
    static YAMLMapping* CreateWithRoom(bool flow, std::size_t capacity) {
        void* memory = ArenaAllocate(sizeof(YAMLMapping) + capacity * sizeof(Entry));
        void* behind = static_cast<YAMLMapping*>(memory) + 1;
        return new (memory) YAMLMapping(flow, static_cast<Entry*>(behind), capacity);
    }

    /// The bytes that the writer would give for this object, or nothing where they aren't known. Valid until
    /// the object is changed; they belong to whoever read the file.
    std::string_view Source() const { return m_Extra ? m_Extra->source : std::string_view(); }
    void SetSource(std::string_view source) { NeedExtra().source = source; }

    bool HasDuplicates() const { return m_HasDuplicates; }
    /// Throws the duplicate-keys YAMLError in the duplicate state.
    void RequireNormalState() const;
    /// All pairs, in either state. In the normal state some may have been removed (their key is null).
    std::span<const Entry> RawEntries() const { return {m_Entries.data(), m_Entries.size()}; }

    void Reserve(std::size_t count) { m_Entries.reserve(count); }
    /// Adds a pair at the end. A key that is there already keeps its value if the new one is equal (which is
    /// dropped), and brings on the duplicate state if not. Never throws a YAMLError.
    void Append(const YAMLScalar* key, YAMLNode* value);
    /// Appends pairs to be filled in by the caller, who then calls AdoptBlank.
    Entry* AppendBlank(std::size_t count) { return m_Entries.append_blank(count); }
    /// Takes in what was filled in. False if a key stands in the mapping twice, which must be given up then.
    bool AdoptBlank();
    /// Appends keys and values that stand by turns, `count` of both; pairs whose key is no scalar are left
    /// out.
    void AppendPairs(YAMLNode* const* keysAndValues, std::size_t count);
    /// Adds a new pair at the end. Throws "Cannot add existing key in YAMLMapping".
    void Insert(const YAMLScalar* key, YAMLNode* value);
    /// Replaces a value in place and returns the old one. Throws "Cannot change non existing key in
    /// YAMLMapping".
    YAMLNode* Change(const YAMLScalar* key, YAMLNode* value);
    /// The value of `key`, or null.
    YAMLNode* Get(const YAMLScalar* key) const;
    /// The value of `key`. Throws "Cannot get unknown key from yaml mapping".
    YAMLNode* GetRef(const YAMLScalar* key) const;
    /// The value of `key`, ready to be changed inside: an object that is shared is replaced by a copy first,
    /// and one whose source bytes are known forgets them. Null or a throw as with Get.
    YAMLNode* GetForChange(const YAMLScalar* key);
    bool HasKey(const YAMLScalar* key) const { return Get(key) != nullptr; }
    std::size_t Size() const;
    Iterator begin() const;
    Iterator end() const;
    /// The pair of `key`, or end().
    Iterator FindKey(const YAMLScalar* key) const;
    /// The first pair's value. The mapping must not be empty.
    YAMLNode* First() const { return begin()->value; }
    /// Takes the pair out and returns its value, or null if there is none. The other keys keep their order.
    /// Amortised constant time in big mappings.
    YAMLNode* Steal(const YAMLScalar* key);
    /// Takes the pair out, if it is there, and frees its value.
    void Remove(const YAMLScalar* key);
    /// The value moves to `to`, which takes the place of `from`. `to` must not be there.
    /// Throws "Cannot change key of non existing key in YAMLMapping".
    void ChangeKey(const YAMLScalar* from, const YAMLScalar* to);
    /// Takes the keys of `order`, those the mapping lacks left out, as the new order. Throws "Unmapped key
    /// when trying to reorder mapping keys" unless as many are left as the mapping has.
    void Reorder(const std::vector<const YAMLScalar*>& order);
    /// A new sequence with a block mapping of one key for every pair, in either state; values are cloned.
    /// Hashes are not built.
    YAMLSequence* ToSequence() const;
    /// Fills an empty mapping with a deep copy.
    void CloneInto(YAMLMapping& target) const;
    /// Fills an empty mapping with the same pairs and marks the values that are mappings as shared.
    void ShareInto(YAMLMapping& target);
    /// Frees all values and empties the mapping; it stays in its state.
    void Clear();

    void Free() {
        if (!m_IsShared) YAMLAlloc<YAMLMapping>::free(this);
    }
    YAMLNode* Clone() const;
    bool Equals(const YAMLNode* other) const;
    bool EqualsExpensive(const YAMLNode* other) const;
    void RebuildHash(bool shallow);
    void ResetForAlloc() { Clear(); }

private:
    /// Position of `key` in m_Entries, or KeyIndex::kMissing.
    std::uint32_t Find(const YAMLScalar* key) const;
    void CopyInto(YAMLMapping& target) const;
    void PushBack(const YAMLScalar* key, YAMLNode* value);
    void BuildIndex();
    void DropIndex();

    /// What few mappings have.
    struct Extra {
        std::string_view source;
        KeyIndex* index = nullptr; // positions in m_Entries, once there are more than KeyIndex::kSearchLimit
    };
    KeyIndex* Index() const { return m_Extra ? m_Extra->index : nullptr; }
    Extra& NeedExtra();

    ArenaArray<Entry> m_Entries;
    Extra* m_Extra = nullptr;
};

inline YAMLMapping* AsMapping(YAMLNode* node) {
    return NodeAs<YAMLMapping>(node);
}
inline const YAMLMapping* AsMapping(const YAMLNode* node) {
    return NodeAs<const YAMLMapping>(node);
}

} // namespace ovrin_yaml
