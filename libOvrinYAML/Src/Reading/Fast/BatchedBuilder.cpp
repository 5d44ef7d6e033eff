#include "Reading/Fast/BatchedBuilder.h"

#include "Reading/Fast/PlainScan.h"
#include "Values/Hash.h"
#include "Values/ScalarTable.h"
#include "Values/YAMLSequence.h"

namespace ovrin_yaml {

void BatchedBuilder::AddNewShort(std::string_view text, const ShortText& packed,
                                 ShortTextCache::Entry& entry) {
    const std::uint32_t hash = ScalarTable::HashOf(packed);
    ScalarTable::Instance().PrefetchSlot(hash);
    entry = {packed.low, packed.high, nullptr, hash, static_cast<std::uint16_t>(packed.length), 0};
    AddLate(text, hash, entry);
}

void BatchedBuilder::AddLong(std::string_view text) {
    const std::uint32_t hash = ScalarTable::HashOf(text);
    ScalarTable::Instance().PrefetchSlot(hash);
    AddLate(text, hash, m_LongTexts);
}

void BatchedBuilder::AddLate(std::string_view text, std::uint32_t hash, ShortTextCache::Entry& entry) {
    m_Late[++m_LateCount] = {text.data(), static_cast<std::uint32_t>(text.size()),
                             hash,        static_cast<std::uint32_t>(m_Stack.Size()),
                             &entry,      nullptr};
    entry.user = static_cast<std::uint16_t>(m_LateCount);
    m_Stack.Push(nullptr, hash, static_cast<std::uint32_t>(m_LateCount));
    if (m_LateCount == kMostLate) InternTexts();
}

YAMLScalar* BatchedBuilder::Intern(std::string_view text) {
    if (text.size() > ShortText::kLongest) return ScalarTable::Instance().Intern(text, 0);
    const ShortText packed = ShortText::Pack(text);
    ShortTextCache::Entry& entry = m_ShortTexts.At(packed);
    if (!entry.Holds(packed) || !entry.scalar) {
        YAMLScalar* scalar = ScalarTable::Instance().Intern(text, 0);
        entry = {packed.low, packed.high, scalar, scalar->m_Hash, static_cast<std::uint16_t>(packed.length),
                 0};
    }
    return entry.scalar;
}

void BatchedBuilder::InternTexts() {
    ScalarTable& table = ScalarTable::Instance();
    for (std::size_t i = 1; i <= m_LateCount; ++i) table.PrefetchScalar(m_Late[i].hash);
    for (std::size_t i = 1; i <= m_LateCount; ++i) {
        const LateText& late = m_Late[i];
        YAMLScalar* scalar = table.Intern({late.text, late.length}, late.hash, 0);
        ShortTextCache::Entry* entry = late.entry->user == i ? late.entry : &m_LongTexts;
        entry->scalar = scalar;
        entry->user = 0;
        if (late.place)
            *late.place = scalar;
        else
            m_Stack[late.index] = Node(scalar, late.hash);
    }
    m_LateCount = m_FirstLate = 0;
}

bool BatchedBuilder::CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t unhashed) {
    const Node* nodes = m_Stack.From(mark);
    const std::size_t count = (m_Stack.Size() - mark) / 2;
    const KeyLists::List keys =
        m_KeyLists.Get(count, [nodes](std::size_t i) { return static_cast<YAMLScalar*>(nodes[2 * i].node); });
    if (!keys) return false;
    YAMLMapping* mapping = YAMLMapping::Create(flow, keys, count);
    YAMLNode** values = mapping->Values();
    std::uint32_t hash = 0;
    for (std::size_t i = 0; i < count; ++i) {
        const Node &key = nodes[2 * i], &value = nodes[2 * i + 1];
        values[i] = value.node;
        SetPlace(value, &values[i]);
        if (i < count - unhashed) hash = FoldPair(hash, key.hash, value.hash, static_cast<std::uint32_t>(i));
    }
    mapping->m_Hash = hash;
    mapping->m_Line = line;
    m_Stack.Cut(mark);
    m_Stack.Push(mapping, hash);
    return true;
}

void BatchedBuilder::CloseSequence(std::size_t mark, bool flow, std::uint32_t line) {
    const Node* nodes = m_Stack.From(mark);
    const std::size_t count = m_Stack.Size() - mark;
    YAMLSequence* sequence = YAMLAlloc<YAMLSequence>::create(flow);
    sequence->m_Items.resize(count);
    std::uint32_t hash = 0;
    for (std::size_t i = 0; i < count; ++i) {
        sequence->m_Items[i] = nodes[i].node;
        SetPlace(nodes[i], &sequence->m_Items[i]);
        hash = FoldItem(hash, nodes[i].hash, static_cast<std::uint32_t>(i));
    }
    sequence->m_Hash = hash;
    sequence->m_Line = line;
    m_Stack.Cut(mark);
    m_Stack.Push(sequence, hash);
}

/// A value may still be missing, so only the key can be asked for.
YAMLMapping* BatchedBuilder::TakeObject(bool isStripped) {
    YAMLMapping* object = AsMapping(TakeRoot());
    const bool hasMark = object->FindKey(YAMLScalar::strippedPrefabPlaceHolderName) != object->end();
    if (hasMark && !isStripped) throw NotSure();
    return object;
}

YAMLNode* BatchedBuilder::TakeRoot() {
    YAMLNode* root = m_Stack[0].node;
    m_Stack.Cut(0);
    m_FirstLate = m_LateCount;
    return root;
}

void BatchedBuilder::Clear() {
    m_Stack.Cut(0);
    m_LateCount = m_FirstLate;
}

} // namespace ovrin_yaml
