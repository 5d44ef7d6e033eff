#include "Support/RandomTrees.h"

#include <algorithm>

namespace random_trees {

const YAMLScalar* RandomTrees::FreshKey() {
    return YAMLScalar::Lookup("k" + std::to_string(m_Fresh++));
}

YAMLNode* RandomTrees::FreshScalar() {
    static const char* const kTails[] = {"", " with blanks", ": ", "\nlines\n", "'", "\u00E9", "#"};
    return YAMLScalar::Lookup("v" + std::to_string(m_Fresh++) +
                              (Below(3) ? "" : kTails[Below(std::size(kTails))]));
}

YAMLNode* RandomTrees::FreshElement(int depth, bool keyed) {
    if (!keyed) return FreshValue(depth);
    auto* element = YAMLAlloc<YAMLMapping>::create(Below(2) == 0);
    element->Insert(YAMLScalar::fileID, YAMLScalar::Lookup(std::to_string(m_Fresh++)));
    if (Below(3) == 0) element->Insert(YAMLScalar::guid, FreshScalar());
    if (Below(2)) element->Insert(FreshKey(), FreshValue(depth));
    return element;
}

YAMLNode* RandomTrees::FreshList(int depth) {
    auto* list = YAMLAlloc<YAMLSequence>::create(Below(3) == 0);
    const bool keyed = Below(2);
    for (std::size_t count = Below(6); count > 0; --count)
        list->m_Items.push_back(FreshElement(depth - 1, keyed));
    return list;
}

YAMLNode* RandomTrees::FreshValue(int depth) {
    if (depth <= 0 || Below(2)) return FreshScalar();
    if (Below(2)) return FreshList(depth);
    auto* mapping = YAMLAlloc<YAMLMapping>::create(Below(3) == 0);
    for (std::size_t count = 1 + Below(Below(6) ? 4 : 24); count > 0; --count)
        mapping->Insert(FreshKey(), FreshValue(depth - 1));
    return mapping;
}

YAMLMapping* RandomTrees::Body() {
    auto* body = YAMLAlloc<YAMLMapping>::create();
    for (std::size_t count = 1 + Below(7); count > 0; --count) body->Insert(FreshKey(), FreshValue(3));
    body->RebuildHash(false);
    return body;
}

YAMLMapping* RandomTrees::Edited(const YAMLMapping* source, const EditLimits& limits) {
    YAMLMapping* copy = AsMapping(source->Clone());
    for (std::size_t edits = 1 + Below(4); edits > 0; --edits) EditMapping(*copy, limits, true);
    copy->RebuildHash(false);
    return copy;
}

YAMLNode* RandomTrees::EditedValue(YAMLNode* value, const EditLimits& limits) {
    if (AsScalar(value) || Below(6) == 0) return FreshScalar();
    if (YAMLMapping* mapping = AsMapping(value))
        EditMapping(*mapping, limits, false);
    else
        EditList(*AsSequence(value), limits);
    return value;
}

void RandomTrees::MoveKeys(YAMLMapping& mapping) {
    std::vector<const YAMLScalar*> order;
    for (const auto& entry : mapping) order.push_back(entry.key);
    std::shuffle(order.begin(), order.end(), m_Random);
    mapping.Reorder(order);
}

void RandomTrees::EditMapping(YAMLMapping& mapping, const EditLimits& limits, bool isRoot) {
    const std::size_t size = mapping.Size();
    const std::size_t kind = size == 0 ? 0 : Below(8);
    if (kind <= 1) {
        mapping.Insert(FreshKey(), FreshValue(2));
        if (isRoot ? limits.movesRootKeys : limits.movesKeys) MoveKeys(mapping);
        return;
    }
    auto entry = mapping.begin();
    for (std::size_t skipped = Below(size); skipped > 0; --skipped) ++entry;
    if (entry->key == YAMLScalar::fileID || entry->key == YAMLScalar::guid)
        return; // an element keeps its key
    const YAMLScalar* key = entry->key;
    if (kind == 2 && size > 1)
        mapping.Remove(key);
    else
        mapping.Change(key, EditedValue(entry->value, limits));
}

void RandomTrees::EditList(YAMLSequence& list, const EditLimits& limits) {
    auto& items = list.m_Items;
    const std::size_t kind = items.empty() ? 0 : Below(4);
    const std::size_t at = items.empty() ? 0 : Below(items.size());
    const bool keyed = std::all_of(items.begin(), items.end(), [](const YAMLNode* item) {
        const YAMLMapping* mapping = AsMapping(item);
        return mapping && mapping->HasKey(YAMLScalar::fileID);
    });
    if (kind == 0)
        items.insert(items.begin() + static_cast<std::ptrdiff_t>(at), FreshElement(2, keyed));
    else if (kind == 1)
        items.erase(items.begin() + static_cast<std::ptrdiff_t>(at));
    else if (kind == 2 && limits.movesElements)
        std::swap(items[at], items[Below(items.size())]);
    else if (Below(20))
        items[at] = EditedValue(items[at], limits);
}

} // namespace random_trees
