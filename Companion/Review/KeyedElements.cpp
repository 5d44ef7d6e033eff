#include "Review/KeyedElements.h"

#include "Values/YAMLError.h"
#include "Values/YAMLSequence.h"

#include <map>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using Key = std::vector<const YAMLScalar*>;

Key KeyOf(const ListRule& rule, const YAMLNode* item) {
    try {
        return MergeRules::GetUniqueMappingValues(rule.keys, item);
    } catch (const YAMLError&) { // of repeated keys
        return {};
    }
}

} // namespace

std::optional<std::vector<ElementIndexes>> MatchElements(const std::array<const YAMLNode*, 4>& lists,
                                                         const ListRule& rule) {
    if (rule.keys.empty()) return std::nullopt;
    std::vector<ElementIndexes> elements;
    std::map<Key, std::size_t> known; // only looked up: the addresses say nothing of the order
    for (std::size_t version = lists.size(); version-- > 0;) {
        if (!lists[version]) continue;
        const YAMLSequence* list = AsSequence(lists[version]);
        if (!list) return std::nullopt;
        for (std::size_t i = 0; i < list->m_Items.size(); ++i) {
            Key key = list->m_Items[i] ? KeyOf(rule, list->m_Items[i]) : Key();
            if (key.empty()) return std::nullopt;
            const auto [found, isNew] = known.try_emplace(std::move(key), elements.size());
            if (isNew) elements.push_back({-1, -1, -1, -1});
            int& index = elements[found->second][version];
            if (index >= 0) return std::nullopt;
            index = static_cast<int>(i);
        }
    }
    return elements;
}

} // namespace ovrin
