#include "Document/KeyLists.h"

#include "Document/Arena.h"
#include "Document/KeyIndex.h"

#include <algorithm>

namespace ovrin_yaml {

const YAMLScalar** KeyLists::Allocate(std::size_t count) {
    // Null tells of a repeated key, so even an empty list is somewhere.
    return static_cast<const YAMLScalar**>(ArenaAllocate(std::max<std::size_t>(count, 1) * sizeof(List)));
}

bool KeyLists::HasRepeatedKey(std::span<const YAMLScalar* const> keys) {
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
