#include "Values/KeyIndex.h"

#include "Values/Arena.h"

#include <bit>

namespace ovrin_yaml {

void KeyIndex::Reserve(std::size_t count) {
    const std::size_t capacity = std::bit_ceil(2 * count + 2);
    if (capacity > m_Slots.size()) Rehash(capacity);
}

void KeyIndex::Set(const YAMLScalar* key, std::uint32_t position) {
    Slot& slot = NeedSlot(key);
    if (!slot.key) ++m_Count;
    slot = {key, position};
}

bool KeyIndex::Insert(const YAMLScalar* key, std::uint32_t position) {
    Slot& slot = NeedSlot(key);
    if (slot.key) return false;
    ++m_Count;
    slot = {key, position};
    return true;
}

std::uint32_t KeyIndex::Find(const YAMLScalar* key) const {
    if (m_Slots.empty()) return kMissing;
    const Slot& slot = m_Slots[PlaceOf(key)];
    return slot.key ? slot.position : kMissing;
}

std::size_t KeyIndex::PlaceOf(const YAMLScalar* key) const {
    const std::size_t mask = m_Slots.size() - 1;
    std::size_t place = FirstPlaceOf(key);
    while (m_Slots[place & mask].key && m_Slots[place & mask].key != key) ++place;
    return place & mask;
}

KeyIndex::Slot& KeyIndex::NeedSlot(const YAMLScalar* key) {
    if (2 * (m_Count + 1) > m_Slots.size()) Reserve(m_Count + 1);
    return m_Slots[PlaceOf(key)];
}

void KeyIndex::Rehash(std::size_t capacity) {
    SlotVector old(capacity);
    old.swap(m_Slots);
    for (const Slot& slot : old)
        if (slot.key) m_Slots[PlaceOf(slot.key)] = slot;
}

} // namespace ovrin_yaml
