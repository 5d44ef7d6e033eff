#include "Document/YAMLMapping.h"

#include "Document/Hash.h"
#include "Document/YAMLScalar.h"
#include "Document/YAMLSequence.h"

#include <algorithm>

namespace ovrin_yaml {

static_assert(sizeof(YAMLMapping) == 40, "there are millions of them");

YAMLMapping::~YAMLMapping() {
    DropIndex();
}

YAMLMapping::Extra& YAMLMapping::NeedExtra() {
    if (!m_Extra) m_Extra = new (ArenaAllocate(sizeof(Extra))) Extra;
    return *m_Extra;
}

void YAMLMapping::RequireNormalState() const {
    if (m_HasDuplicates) throw YAMLError("Cannot perform this operation on a YAML file with duplicate keys");
}

std::uint32_t YAMLMapping::Find(const YAMLScalar* key) const {
    if (const KeyIndex* index = Index()) {
        // The index keeps keys that were removed since; their positions hold null or, after a move, others.
        const std::uint32_t position = index->Find(key);
        const bool there = position < m_Entries.size() && m_Entries[position].key == key;
        return there ? position : KeyIndex::kMissing;
    }
    for (std::uint32_t i = 0; i < m_Entries.size(); ++i)
        if (m_Entries[i].key == key) return i;
    return KeyIndex::kMissing;
}

void YAMLMapping::PushBack(const YAMLScalar* key, YAMLNode* value) {
    m_Entries.push_back({key, value});
    if (KeyIndex* index = Index())
        index->Set(key, static_cast<std::uint32_t>(m_Entries.size() - 1));
    else if (m_Entries.size() > KeyIndex::kSearchLimit)
        BuildIndex();
}

void YAMLMapping::BuildIndex() {
    KeyIndex*& index = NeedExtra().index;
    if (!index) index = new KeyIndex;
    index->Reserve(m_Entries.capacity());
    for (std::uint32_t i = 0; i < m_Entries.size(); ++i) index->Set(m_Entries[i].key, i);
}

void YAMLMapping::DropIndex() {
    if (!m_Extra) return;
    delete m_Extra->index;
    m_Extra->index = nullptr;
}

void YAMLMapping::Append(const YAMLScalar* key, YAMLNode* value) {
    if (m_HasDuplicates) {
        m_Entries.push_back({key, value});
        return;
    }
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) {
        PushBack(key, value);
        return;
    }
    if (m_Entries[position].value->Equals(value)) return;
    m_Entries.erase_if([](const Entry& entry) { return !entry.key; });
    m_Removed = 0;
    DropIndex();
    m_Entries.push_back({key, value});
    m_HasDuplicates = true;
}

bool YAMLMapping::AdoptBlank() {
    if (m_Entries.size() > KeyIndex::kSearchLimit) {
        BuildIndex();
        return Index()->Count() == m_Entries.size();
    }
    for (const Entry* entry = m_Entries.begin(); entry != m_Entries.end(); ++entry)
        for (const Entry* earlier = m_Entries.begin(); earlier != entry; ++earlier)
            if (earlier->key == entry->key) return false;
    return true;
}

void YAMLMapping::AppendPairs(YAMLNode* const* keysAndValues, std::size_t count) {
    for (std::size_t i = 0; i + 1 < count; i += 2)
        if (const YAMLScalar* key = AsScalar(keysAndValues[i])) Append(key, keysAndValues[i + 1]);
}

void YAMLMapping::Insert(const YAMLScalar* key, YAMLNode* value) {
    RequireNormalState();
    if (Find(key) != KeyIndex::kMissing) throw YAMLError("Cannot add existing key in YAMLMapping");
    PushBack(key, value);
}

YAMLNode* YAMLMapping::Change(const YAMLScalar* key, YAMLNode* value) {
    RequireNormalState();
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) throw YAMLError("Cannot change non existing key in YAMLMapping");
    return std::exchange(m_Entries[position].value, value);
}

YAMLNode* YAMLMapping::Get(const YAMLScalar* key) const {
    RequireNormalState();
    const std::uint32_t position = Find(key);
    return position == KeyIndex::kMissing ? nullptr : m_Entries[position].value;
}

YAMLNode* YAMLMapping::GetRef(const YAMLScalar* key) const {
    if (YAMLNode* value = Get(key)) return value;
    throw YAMLError("Cannot get unknown key from yaml mapping");
}

YAMLNode* YAMLMapping::GetForChange(const YAMLScalar* key) {
    YAMLNode* value = Get(key);
    YAMLMapping* object = AsMapping(value);
    if (!object) return value;
    if (object->m_IsShared) {
        object = AsMapping(CopyExactly(object));
        Change(key, object);
    }
    if (object->m_Extra) object->m_Extra->source = {};
    object->m_Traits = 0;
    return object;
}

std::size_t YAMLMapping::Size() const {
    RequireNormalState();
    return m_Entries.size() - m_Removed;
}

YAMLMapping::Iterator YAMLMapping::begin() const {
    RequireNormalState();
    return {m_Entries.data(), m_Entries.data() + m_Entries.size()};
}

YAMLMapping::Iterator YAMLMapping::end() const {
    RequireNormalState();
    return {m_Entries.data() + m_Entries.size(), m_Entries.data() + m_Entries.size()};
}

YAMLMapping::Iterator YAMLMapping::FindKey(const YAMLScalar* key) const {
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) return end();
    return {m_Entries.data() + position, m_Entries.data() + m_Entries.size()};
}

YAMLNode* YAMLMapping::Steal(const YAMLScalar* key) {
    RequireNormalState();
    const std::uint32_t position = Find(key);
    if (position == KeyIndex::kMissing) return nullptr;
    YAMLNode* value = m_Entries[position].value;
    if (Index()) {
        m_Entries[position] = {nullptr, nullptr};
        ++m_Removed;
    } else {
        m_Entries.erase(position);
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
    m_Entries[position].key = to;
    if (KeyIndex* index = Index()) index->Set(to, position);
}

void YAMLMapping::Reorder(const std::vector<const YAMLScalar*>& order) {
    RequireNormalState();
    ArenaArray<Entry> ordered;
    ordered.reserve(Size());
    for (const YAMLScalar* key : order) {
        const std::uint32_t position = Find(key);
        if (position == KeyIndex::kMissing) continue;
        if (ordered.size() == Size()) throw YAMLError("Unmapped key when trying to reorder mapping keys");
        ordered.push_back(m_Entries[position]);
    }
    if (ordered.size() != Size()) throw YAMLError("Unmapped key when trying to reorder mapping keys");
    m_Entries.swap(ordered);
    m_Removed = 0;
    if (Index()) BuildIndex();
}

YAMLSequence* YAMLMapping::ToSequence() const {
    YAMLSequence* sequence = YAMLAlloc<YAMLSequence>::create(m_Flow);
    for (const Entry& entry : m_Entries) {
        if (!entry.key) continue;
        YAMLMapping* pair = YAMLAlloc<YAMLMapping>::create(false);
        pair->Insert(entry.key, entry.value->Clone());
        sequence->m_Items.push_back(pair);
    }
    return sequence;
}

void YAMLMapping::CopyInto(YAMLMapping& target) const {
    RequireNormalState();
    target.m_Flow = m_Flow;
    target.m_Hash = m_Hash;
    target.m_Line = m_Line;
    target.m_Entries.clear();
    target.m_Entries.reserve(Size());
    for (const Entry& entry : *this) target.m_Entries.push_back(entry);
    if (target.m_Entries.size() > KeyIndex::kSearchLimit) target.BuildIndex();
}

void YAMLMapping::CloneInto(YAMLMapping& target) const {
    CopyInto(target);
    for (Entry& entry : target.m_Entries) entry.value = entry.value->Clone();
}

void YAMLMapping::ShareInto(YAMLMapping& target) {
    CopyInto(target);
    for (const Entry& entry : target.m_Entries)
        if (YAMLMapping* object = AsMapping(entry.value)) object->m_IsShared = true;
}

YAMLNode* YAMLMapping::Clone() const {
    YAMLMapping* clone = YAMLAlloc<YAMLMapping>::create(m_Flow);
    CloneInto(*clone);
    return clone;
}

void YAMLMapping::Clear() {
    for (const Entry& entry : m_Entries)
        if (entry.value) entry.value->Free();
    m_Entries.clear();
    m_Removed = 0;
    DropIndex();
}

bool YAMLMapping::Equals(const YAMLNode* other) const {
    if (m_Hash && other->m_Hash) return m_Hash == other->m_Hash;
    return EqualsExpensive(other);
}

bool YAMLMapping::EqualsExpensive(const YAMLNode* other) const {
    const YAMLMapping* mapping = AsMapping(other);
    if (!mapping) return false;
    // In the duplicate state there are no keys to tell two mappings apart by.
    static const YAMLMapping none;
    const YAMLMapping& left = m_HasDuplicates ? none : *this;
    const YAMLMapping& right = mapping->m_HasDuplicates ? none : *mapping;
    return left.Size() == right.Size() &&
           std::equal(left.begin(), left.end(), right.begin(),
                      [](const Entry& a, const Entry& b) { return a.key == b.key; });
}

void YAMLMapping::RebuildHash(bool shallow) {
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    if (!m_HasDuplicates) {
        for (const Entry& entry : *this) {
            if (!shallow) entry.value->RebuildHash(false);
            hash = FoldPair(hash, entry.key->m_Hash, entry.value->m_Hash, index++);
        }
    }
    m_Hash = hash;
}

} // namespace ovrin_yaml
