#include "Reading/Fast/KeyLists.h"

#include "Values/Arena.h"
#include "Values/KeyIndex.h"

#include <algorithm>

namespace ovrin_yaml {

namespace {

/// False only if no two of the keys are the same. Each sets a bit in both of two words.
bool MayRepeatKey(std::span<const YAMLScalar* const> keys) {
    std::uint64_t first = 0, second = 0, both = 0;
    for (const YAMLScalar* key : keys) {
        const unsigned bit = key->m_Hash % 64, other = key->m_Hash / 64 % 64;
        both |= first >> bit & second >> other;
        first |= std::uint64_t{1} << bit;
        second |= std::uint64_t{1} << other;
    }
    return both & 1;
}

} // namespace

const YAMLScalar** KeyLists::Allocate(std::size_t count) {
    // Null tells of a repeated key, so even an empty list is somewhere.
    return static_cast<const YAMLScalar**>(ArenaAllocate(std::max<std::size_t>(count, 1) * sizeof(List)));
}

bool KeyLists::HasRepeatedKey(std::span<const YAMLScalar* const> keys) {
    if (!MayRepeatKey(keys)) return false;
    if (keys.size() > KeyIndex::kSearchLimit) {
        KeyIndex index;
        index.Reserve(keys.size());
        for (const YAMLScalar* key : keys) index.Set(key, 0);
        return index.Count() != keys.size();
    }
    for (auto key = keys.begin(); key != keys.end(); ++key)
        if (std::find(keys.begin(), key, *key) != key) return true;
    return false;
}

} // namespace ovrin_yaml
