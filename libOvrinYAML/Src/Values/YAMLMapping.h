#pragma once

#include "Values/KeyIndex.h"
#include "Values/TreeMaker.h"
#include "Values/YAMLAlloc.h"
#include "Values/YAMLError.h"
#include "Values/YAMLNode.h"

#include <cassert>
#include <cstddef>
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
///
/// There are millions of mappings, and few lists of keys: one that a reader made refers to a list that it has
/// in common with others, and its values stand right behind it.
///
///     {x: 1, y: 2}    [ mapping | 1 | 2 ]  ->  [ x | y ]
///     {x: 5, y: 7}    [ mapping | 5 | 7 ]  ------^
///
/// A change of the keys gives the mapping a list of its own, and new pairs give it new arrays for both. At
/// most kMostPairs: what would bring more throws YAMLError "Mapping is too long".
///
/// An object of which nobody has asked for a pair yet may be unbuilt: its bytes and traits are known, and its
/// tree is made when somebody asks. Until then it has no hash either.
class YAMLMapping final : public YAMLNode {
public:
    static constexpr Kind kKind = Kind::Mapping;
    static constexpr std::size_t kMostPairs = (std::size_t{1} << 30) - 1;

    struct Entry {
        const YAMLScalar* key; // null: a pair that was removed, passed over by iteration
        YAMLNode* value;
    };

    /// Keys and values that stand in two arrays, which must outlive the view.
    class Pairs {
    public:
        Pairs(const YAMLScalar* const* keys, YAMLNode* const* values, std::size_t size)
            : m_Keys(keys), m_Values(values), m_Size(size) {}

        std::size_t size() const { return m_Size; }
        Entry operator[](std::size_t index) const { return {m_Keys[index], m_Values[index]}; }

        class Iterator {
        public:
            Iterator(const YAMLScalar* const* key, YAMLNode* const* value) : m_Key(key), m_Value(value) {}
            Entry operator*() const { return {*m_Key, *m_Value}; }
            Iterator& operator++() {
                ++m_Key;
                ++m_Value;
                return *this;
            }
            bool operator==(const Iterator& other) const { return m_Key == other.m_Key; }

        private:
            const YAMLScalar* const* m_Key;
            YAMLNode* const* m_Value;
        };
        Iterator begin() const { return {m_Keys, m_Values}; }
        Iterator end() const { return {m_Keys + m_Size, m_Values + m_Size}; }

    private:
        const YAMLScalar* const* m_Keys;
        YAMLNode* const* m_Values;
        std::size_t m_Size;
    };

    /// Iterates over the pairs in document order. The mapping must not gain or lose keys meanwhile.
    class Iterator {
    public:
        Iterator(const Pairs& pairs, std::size_t index) : m_Pairs(pairs), m_Index(index) { SkipRemoved(); }
        Entry operator*() const { return m_Pairs[m_Index]; }
        Iterator& operator++() {
            ++m_Index;
            SkipRemoved();
            return *this;
        }
        bool operator==(const Iterator& other) const { return m_Index == other.m_Index; }

        struct Arrow {
            Entry entry;
            const Entry* operator->() const { return &entry; }
        };
        Arrow operator->() const { return {**this}; }

    private:
        void SkipRemoved() {
            while (m_Index != m_Pairs.size() && !m_Pairs[m_Index].key) ++m_Index;
        }

        Pairs m_Pairs;
        std::size_t m_Index;
    };

    explicit YAMLMapping(bool flow = false) : YAMLNode(Kind::Mapping), m_Flow(flow) {}
    YAMLMapping(const YAMLMapping&) = delete;
    YAMLMapping& operator=(const YAMLMapping&) = delete;
    ~YAMLMapping();

    /// The mapping was written in flow style, {...}.
    bool m_Flow;

    /// A new mapping of keys that are all different, at most kMostPairs, with the values, which stand right
    /// behind it in memory, to be filled in by the caller. The array of keys may be that of many mappings; it
    /// must stay as it is until the process ends.
    static YAMLMapping* Create(bool flow, const YAMLScalar* const* keys, std::size_t count) {
        void* memory = ArenaAllocate(sizeof(YAMLMapping) + count * sizeof(YAMLNode*));
        YAMLMapping* mapping = new (memory) YAMLMapping(flow);
        mapping->m_Keys = keys;
        mapping->m_Size = static_cast<std::uint32_t>(count);
        if (count > KeyIndex::kSearchLimit) mapping->BuildIndex();
        return mapping;
    }
    /// A new object that is unbuilt: `source` are its bytes, as SetSource has them, of which `maker` makes
    /// the tree. Both must stay as long as somebody may ask for it. It is shared from the start.
    static YAMLMapping* CreateUnbuilt(std::string_view source, TreeMaker& maker);
    /// Whether the tree is there: who can do without it may spare its cost.
    bool IsBuilt() const { return !(State() & kUnbuilt); }
    /// Builds the tree if it isn't there, for who reads m_Hash or m_Line; all that asks for pairs does so.
    void NeedTree() const {
        if (!IsBuilt()) [[unlikely]]
            BuildTree();
    }
    /// The values, in the order of RawEntries.
    YAMLNode** Values() {
        NeedTree();
        return m_Extra && m_Extra->values ? m_Extra->values : ValuesBehind();
    }

    /// The bytes that the writer would give for this object, or nothing where they aren't known. Valid until
    /// the object is changed; they belong to whoever read the file.
    std::string_view Source() const { return m_Extra ? m_Extra->source : std::string_view(); }
    void SetSource(std::string_view source) { NeedExtra().source = source; }

    /// What an inspector found in this object when it was read (ReaderOptions::inspect), or when the changes
    /// of a merge had been applied; 0: nobody looked, or the object was changed since.
    std::uint8_t Traits() const { return m_Traits; }
    void SetTraits(std::uint8_t traits) { m_Traits = traits; }
    void SetTraitsOfChanged(std::uint8_t traits) {
        m_Traits = traits;
        m_State |= kChanged;
    }

    /// Whether several trees hold this mapping, an object: it is never freed, and copied before it is
    /// changed.
    bool IsShared() const { return State() & kShared; }
    void MarkAsShared() { m_State |= kShared; }

    /// Whether the object is known to be as it was when its hashes were built. What changes one first gets it
    /// from GetForChange, which ends this state.
    bool IsKnownUnchanged() const {
        return IsShared() || (m_Traits && !(State() & kChanged)) || !Source().empty();
    }

    bool HasDuplicates() const {
        NeedTree();
        return m_HasDuplicates;
    }
    /// Throws the duplicate-keys YAMLError in the duplicate state.
    void RequireNormalState() const {
        if (HasDuplicates()) [[unlikely]]
            FailForDuplicates();
    }
    /// All pairs, in either state. In the normal state some may have been removed (their key is null).
    Pairs RawEntries() const {
        YAMLNode* const* values = const_cast<YAMLMapping*>(this)->Values();
        return {m_Keys, values, m_Size};
    }

    /// Makes room for `count` pairs in all.
    void Reserve(std::size_t count);
    /// Adds a pair at the end. A key that is there already keeps its value if the new one is equal (which is
    /// dropped), and brings on the duplicate state if not.
    void Append(const YAMLScalar* key, YAMLNode* value);
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
    /// Starts to load what a big mapping is asked for `key` with. Any pointer will do, as it isn't followed.
    void PrefetchKey(const YAMLScalar* key) const {
        if (const KeyIndex* index = Index()) index->Prefetch(key);
    }
    std::size_t Size() const;
    Iterator begin() const {
        RequireNormalState();
        return {RawEntries(), 0};
    }
    Iterator end() const {
        RequireNormalState();
        return {RawEntries(), m_Size};
    }
    /// The position of `key` in RawEntries, or KeyIndex::kMissing. Not in the duplicate state.
    std::uint32_t Find(const YAMLScalar* key) const;
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
    /// A copy in the same state, owned by the caller, of what `copyValue` makes of each value.
    YAMLMapping* CopyWith(YAMLNode* (*copyValue)(const YAMLNode*)) const;
    /// Fills an empty mapping with the same pairs and marks the values that are mappings as shared.
    void ShareInto(YAMLMapping& target);
    /// Frees all values and empties the mapping; it stays in its state.
    void Clear();

    void Free() {
        if (!IsShared()) YAMLAlloc<YAMLMapping>::free(this);
    }
    YAMLNode* Clone() const;
    bool Equals(const YAMLNode* other) const;
    bool EqualsExpensive(const YAMLNode* node) const;
    void RebuildHash(bool shallow);
    void ResetForAlloc() { Clear(); }

private:
    /// What few mappings have.
    struct Extra {
        std::string_view source;
        TreeMaker* maker = nullptr;  // of an object that was unbuilt at first
        KeyIndex* index = nullptr;   // positions, once there are more than KeyIndex::kSearchLimit
        YAMLNode** values = nullptr; // where they went when there was no more room behind the mapping
        std::uint32_t room = 0;      // for values there, and for keys that are the mapping's own
        std::uint32_t removed = 0;   // pairs whose key is null; only where there is an index
        bool leftOut = false;        // the hash covers pairs that were not kept: it can't be checked
    };
    friend class TreeCheck;

    enum State : std::uint8_t { kShared = 1, kUnbuilt = 2, kChanged = 4 };

    /// What is there for threads that see the tree as built.
    std::uint8_t State() const { return __atomic_load_n(&m_State, __ATOMIC_ACQUIRE); }
    [[noreturn]] static void FailForDuplicates();
    void BuildTree() const;
    void TakeTree(YAMLMapping& tree);

    Extra& NeedExtra();
    KeyIndex* Index() const { return m_Extra ? m_Extra->index : nullptr; }
    std::uint32_t RemovedCount() const { return m_Extra ? m_Extra->removed : 0; }

    YAMLNode** ValuesBehind() { return reinterpret_cast<YAMLNode**>(this + 1); }
    /// The keys, for a change: a list that may be that of other mappings is copied first.
    const YAMLScalar** OwnKeys();
    const YAMLScalar* const* KeysForCopy() const;
    std::size_t Room() const { return m_Extra && m_Extra->values ? m_Extra->room : m_Size; }
    void MoveTo(std::size_t room);
    void DropRemoved();
    void PushRaw(const YAMLScalar* key, YAMLNode* value);
    void PushBack(const YAMLScalar* key, YAMLNode* value);
    void BuildIndex();
    void DropIndex();

    /// Ahead of every change.
    void AssertMayChange() const { assert(!IsKnownUnchanged() && "an object that GetForChange didn't give"); }

    std::uint8_t m_Traits = 0;
    std::uint8_t m_State = 0;
    std::uint32_t m_HasDuplicates : 1 = 0;
    std::uint32_t m_OwnsKeys : 1 = 0;
    std::uint32_t m_Size : 30 = 0; // pairs, those removed included
    const YAMLScalar* const* m_Keys = nullptr;
    Extra* m_Extra = nullptr;
};

inline YAMLMapping* AsMapping(YAMLNode* node) {
    return NodeAs<YAMLMapping>(node);
}
inline const YAMLMapping* AsMapping(const YAMLNode* node) {
    return NodeAs<const YAMLMapping>(node);
}

} // namespace ovrin_yaml
