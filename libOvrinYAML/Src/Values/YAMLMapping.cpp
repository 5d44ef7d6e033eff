#include "Values/YAMLMapping.h"

#include "Values/Hash.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <mutex>

namespace ovrin_yaml {

static_assert(sizeof(YAMLMapping) == 32, "there are millions of them");

YAMLMapping::~YAMLMapping() {
    DropIndex();
}

YAMLMapping::Extra& YAMLMapping::NeedExtra() {
    if (!m_Extra) m_Extra = new (ArenaAllocate(sizeof(Extra))) Extra;
    return *m_Extra;
}

YAMLMapping* YAMLMapping::CreateUnbuilt(std::string_view source, TreeMaker& maker) {
    YAMLMapping* object = Create(false, nullptr, 0);
    object->SetSource(source);
    object->m_Extra->maker = &maker;
    object->m_State = kShared | kUnbuilt;
    return object;
}

void YAMLMapping::BuildTree() const {
    TreeMaker& maker = *m_Extra->maker;
    const std::lock_guard lock(maker.m_Lock);
    if (!IsBuilt()) const_cast<YAMLMapping*>(this)->TakeTree(*maker.Make(m_Extra->source));
}

/// Takes the pairs of a tree that is nobody's.
void YAMLMapping::TakeTree(YAMLMapping& tree) {
    assert(!tree.m_HasDuplicates);
    m_Hash = tree.m_Hash;
    m_Line = tree.m_Line;
    m_Keys = tree.m_Keys;
    m_Size = tree.m_Size;
    m_Extra->values = tree.Values();
    m_Extra->room = tree.m_Size;
    m_Extra->index = tree.Index();
    __atomic_store_n(&m_State, std::uint8_t{kShared}, __ATOMIC_RELEASE);
}

void YAMLMapping::FailForDuplicates() {
    throw YAMLError("Cannot perform this operation on a YAML file with duplicate keys");
}

void YAMLMapping::MoveTo(std::size_t room) {
    if (room > kMostPairs) throw YAMLError("Mapping is too long");
    void* memory = ArenaAllocate(room * (sizeof(YAMLNode*) + sizeof(YAMLScalar*)));
    auto** values = static_cast<YAMLNode**>(memory);
    auto** keys = static_cast<const YAMLScalar**>(static_cast<void*>(values + room));
    std::copy_n(Values(), m_Size, values);
    std::copy_n(m_Keys, m_Size, keys);
    Extra& extra = NeedExtra();
    extra.values = values;
    extra.room = static_cast<std::uint32_t>(room);
    m_Keys = keys;
    m_OwnsKeys = true;
}

void YAMLMapping::Reserve(std::size_t count) {
    if (count > Room() || !m_OwnsKeys) MoveTo(std::max<std::size_t>(count, m_Size));
}

const YAMLScalar** YAMLMapping::OwnKeys() {
    if (!m_OwnsKeys) {
        auto** keys = static_cast<const YAMLScalar**>(ArenaAllocate(Room() * sizeof(YAMLScalar*)));
        m_Keys = std::copy_n(m_Keys, m_Size, keys) - m_Size;
        m_OwnsKeys = true;
    }
    return const_cast<const YAMLScalar**>(m_Keys);
}

/// A list of the keys that will not change.
const YAMLScalar* const* YAMLMapping::KeysForCopy() const {
    if (!m_OwnsKeys) return m_Keys;
    auto** keys = static_cast<const YAMLScalar**>(ArenaAllocate(m_Size * sizeof(YAMLScalar*)));
    std::copy_if(m_Keys, m_Keys + m_Size, keys, [](const YAMLScalar* key) { return key; });
    return keys;
}

std::uint32_t YAMLMapping::Find(const YAMLScalar* key) const {
    NeedTree();
    if (const KeyIndex* index = Index()) {
        // The index keeps keys that were removed since; their positions hold null or, after a move, others.
        const std::uint32_t position = index->Find(key);
        return position < m_Size && m_Keys[position] == key ? position : KeyIndex::kMissing;
    }
    for (std::uint32_t i = 0; i < m_Size; ++i)
        if (m_Keys[i] == key) return i;
    return KeyIndex::kMissing;
}

void YAMLMapping::PushRaw(const YAMLScalar* key, YAMLNode* value) {
    if (m_Size == Room() || !m_OwnsKeys) {
        const std::size_t doubled = std::min(2 * std::size_t{m_Size}, kMostPairs);
        MoveTo(std::max({doubled, std::size_t{m_Size} + 1, std::size_t{4}}));
    }
    OwnKeys()[m_Size] = key;
    m_Extra->values[m_Size] = value;
    ++m_Size;
}

void YAMLMapping::PushBack(const YAMLScalar* key, YAMLNode* value) {
    PushRaw(key, value);
    if (KeyIndex* index = Index())
        index->Set(key, m_Size - 1);
    else if (m_Size > KeyIndex::kSearchLimit)
        BuildIndex();
}

void YAMLMapping::BuildIndex() {
    KeyIndex*& index = NeedExtra().index;
    if (!index) index = new KeyIndex;
    index->Reserve(Room());
    constexpr std::uint32_t kAhead = 8;
    for (std::uint32_t i = 0; i < m_Size; ++i) {
        if (i + kAhead < m_Size) index->Prefetch(m_Keys[i + kAhead]);
        index->Set(m_Keys[i], i);
    }
}

void YAMLMapping::DropIndex() {
    if (!m_Extra) return;
    delete m_Extra->index;
    m_Extra->index = nullptr;
}

void YAMLMapping::DropRemoved() {
    if (RemovedCount() == 0) return;
    const YAMLScalar** keys = OwnKeys();
    std::uint32_t kept = 0;
    for (std::uint32_t i = 0; i < m_Size; ++i) {
        if (!keys[i]) continue;
        Values()[kept] = Values()[i];
        keys[kept++] = keys[i];
    }
    m_Size = kept;
    m_Extra->removed = 0;
}

void YAMLMapping::Append(const YAMLScalar* key, YAMLNode* value) {
    AssertMayChange();
    assert(key && value);
    if (m_HasDuplicates) {
        PushRaw(key, value);
        return;
    }
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) {
        PushBack(key, value);
        return;
    }
    if (Values()[position]->Equals(value)) {
        NeedExtra().leftOut = true;
        return;
    }
    DropRemoved();
    DropIndex();
    PushRaw(key, value);
    m_HasDuplicates = true;
}

void YAMLMapping::AppendPairs(YAMLNode* const* keysAndValues, std::size_t count) {
    for (std::size_t i = 0; i + 1 < count; i += 2) {
        if (const YAMLScalar* key = AsScalar(keysAndValues[i]))
            Append(key, keysAndValues[i + 1]);
        else
            NeedExtra().leftOut = true;
    }
}

void YAMLMapping::Insert(const YAMLScalar* key, YAMLNode* value) {
    RequireNormalState();
    AssertMayChange();
    assert(key && value);
    if (Find(key) != KeyIndex::kMissing) throw YAMLError("Cannot add existing key in YAMLMapping");
    PushBack(key, value);
}

YAMLNode* YAMLMapping::Change(const YAMLScalar* key, YAMLNode* value) {
    RequireNormalState();
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) throw YAMLError("Cannot change non existing key in YAMLMapping");
    AssertMayChange();
    assert(value);
    return std::exchange(Values()[position], value);
}

YAMLNode* YAMLMapping::Get(const YAMLScalar* key) const {
    RequireNormalState();
    const std::uint32_t position = Find(key);
    return position == KeyIndex::kMissing ? nullptr : RawEntries()[position].value;
}

YAMLNode* YAMLMapping::GetRef(const YAMLScalar* key) const {
    if (YAMLNode* value = Get(key)) return value;
    throw YAMLError("Cannot get unknown key from yaml mapping");
}

YAMLNode* YAMLMapping::GetForChange(const YAMLScalar* key) {
    YAMLNode* value = Get(key);
    YAMLMapping* object = AsMapping(value);
    if (!object) return value;
    if (object->IsShared()) {
        object = AsMapping(CopyExactly(object));
        Change(key, object);
    }
    if (object->m_Extra) object->m_Extra->source = {};
    object->m_Traits = 0;
    return object;
}

std::size_t YAMLMapping::Size() const {
    RequireNormalState();
    return m_Size - RemovedCount();
}

YAMLMapping::Iterator YAMLMapping::FindKey(const YAMLScalar* key) const {
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) return end();
    return {RawEntries(), position};
}

YAMLNode* YAMLMapping::Steal(const YAMLScalar* key) {
    RequireNormalState();
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) return nullptr;
    AssertMayChange();
    const YAMLScalar** keys = OwnKeys();
    YAMLNode** values = Values();
    YAMLNode* value = values[position];
    if (Index()) {
        keys[position] = nullptr;
        values[position] = nullptr;
        ++m_Extra->removed;
    } else {
        std::copy(keys + position + 1, keys + m_Size, keys + position);
        std::copy(values + position + 1, values + m_Size, values + position);
        --m_Size;
    }
    return value;
}

void YAMLMapping::Remove(const YAMLScalar* key) {
    if (YAMLNode* value = Steal(key)) value->Free();
}

void YAMLMapping::ChangeKey(const YAMLScalar* from, const YAMLScalar* to) {
    RequireNormalState();
    const std::uint32_t position = Find(from);
    if (position == KeyIndex::kMissing)
        throw YAMLError("Cannot change key of non existing key in YAMLMapping");
    AssertMayChange();
    assert(to && (to == from || Find(to) == KeyIndex::kMissing));
    OwnKeys()[position] = to;
    if (KeyIndex* index = Index()) index->Set(to, position);
}

void YAMLMapping::Reorder(const std::vector<const YAMLScalar*>& order) {
    RequireNormalState();
    AssertMayChange();
    std::vector<Entry> ordered;
    ordered.reserve(Size());
    std::uint32_t position = KeyIndex::kMissing;
    for (const YAMLScalar* key : order) {
        // Most keys follow each other as they did.
        const std::uint32_t next = position + 1;
        position = next < m_Size && m_Keys[next] == key ? next : Find(key);
        if (position == KeyIndex::kMissing) continue;
        if (ordered.size() == Size()) throw YAMLError("Unmapped key when trying to reorder mapping keys");
        ordered.push_back(RawEntries()[position]);
    }
    if (ordered.size() != Size()) throw YAMLError("Unmapped key when trying to reorder mapping keys");
    const YAMLScalar** keys = OwnKeys();
    for (std::size_t i = 0; i < ordered.size(); ++i) {
        keys[i] = ordered[i].key;
        Values()[i] = ordered[i].value;
    }
    m_Size = static_cast<std::uint32_t>(ordered.size());
    if (m_Extra) m_Extra->removed = 0;
    if (Index()) BuildIndex();
}

YAMLSequence* YAMLMapping::ToSequence() const {
    YAMLSequence* sequence = YAMLAlloc<YAMLSequence>::create(m_Flow);
    for (const Entry entry : RawEntries()) {
        if (!entry.key) continue;
        auto** key = static_cast<const YAMLScalar**>(ArenaAllocate(sizeof(YAMLScalar*)));
        *key = entry.key;
        YAMLMapping* pair = Create(false, key, 1);
        pair->Values()[0] = entry.value->Clone();
        sequence->m_Items.push_back(pair);
    }
    return sequence;
}

YAMLMapping* YAMLMapping::CopyWith(YAMLNode* (*copyValue)(const YAMLNode*)) const {
    NeedTree();
    // An index finds no key that is there twice.
    YAMLMapping* copy = Create(m_Flow, KeysForCopy(), m_Size - RemovedCount());
    copy->m_HasDuplicates = m_HasDuplicates;
    if (m_HasDuplicates) copy->DropIndex();
    copy->m_Hash = m_Hash;
    copy->m_Line = m_Line;
    if (m_Extra && m_Extra->leftOut) copy->NeedExtra().leftOut = true;
    YAMLNode** values = copy->Values();
    for (const Entry entry : RawEntries())
        if (entry.key) *values++ = copyValue(entry.value);
    return copy;
}

void YAMLMapping::ShareInto(YAMLMapping& target) {
    target.m_Flow = m_Flow;
    target.m_Hash = m_Hash;
    target.m_Line = m_Line;
    target.Reserve(Size());
    for (const Entry entry : *this) {
        target.PushBack(entry.key, entry.value);
        YAMLMapping* object = AsMapping(entry.value);
        // Only read once it is marked: several threads may take shares then.
        if (object && !object->IsShared()) object->MarkAsShared();
    }
}

YAMLNode* YAMLMapping::Clone() const {
    RequireNormalState();
    return CopyWith([](const YAMLNode* value) { return value->Clone(); });
}

void YAMLMapping::Clear() {
    assert(!IsShared());
    for (const Entry entry : RawEntries())
        if (entry.value) entry.value->Free();
    m_Size = 0;
    if (m_Extra) m_Extra->removed = 0;
    DropIndex();
}

bool YAMLMapping::Equals(const YAMLNode* other) const {
    NeedTree();
    if (const YAMLMapping* mapping = AsMapping(other)) mapping->NeedTree();
    if (m_Hash && other->m_Hash) return m_Hash == other->m_Hash;
    return EqualsExpensive(other);
}

bool YAMLMapping::EqualsExpensive(const YAMLNode* node) const {
    const YAMLMapping* mapping = AsMapping(node);
    if (!mapping) return false;
    // In the duplicate state there are no keys to tell two mappings apart by.
    static const YAMLMapping none;
    const YAMLMapping& left = HasDuplicates() ? none : *this;
    const YAMLMapping& right = mapping->HasDuplicates() ? none : *mapping;
    if (left.Size() != right.Size()) return false;
    Iterator other = right.begin();
    for (const Entry entry : left) {
        if (entry.key != other->key) return false;
        ++other;
    }
    return true;
}

void YAMLMapping::RebuildHash(bool shallow) {
    AssertMayChange();
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    if (!m_HasDuplicates) {
        for (const Entry entry : *this) {
            if (!shallow) entry.value->RebuildHash(false);
            hash = FoldPair(hash, entry.key->m_Hash, entry.value->m_Hash, index++);
        }
    }
    m_Hash = hash;
    if (m_Extra) m_Extra->leftOut = false;
}

} // namespace ovrin_yaml
