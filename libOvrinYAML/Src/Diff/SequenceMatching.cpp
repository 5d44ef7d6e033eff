#include "Diff/SequenceMatching.h"

#include "Diff/EqualityMatcher.h"
#include "Values/KeyIndex.h"
#include "Values/YAMLMapping.h"

#include <algorithm>
#include <memory>

namespace ovrin_yaml {

namespace {

/// The texts joined by ":".
std::string CollapseKeyElementValues(const std::vector<const YAMLScalar*>& values) {
    std::string text;
    for (std::size_t i = 0; i < values.size(); ++i) {
        if (i > 0) text += ':';
        text += values[i]->Value();
    }
    return text;
}

/// Gives the key of sequence elements as one scalar, so that equal keys are the same object.
class ElementKeys {
public:
    /// A key whose first field is a file id is joined by the guid beside it, which says what file it counts
    /// in.
    explicit ElementKeys(const std::vector<Path>& keyPaths) : m_KeyPaths(keyPaths) {
        if (keyPaths.empty() || keyPaths[0].empty() || keyPaths[0].back() != YAMLScalar::fileID) return;
        m_GuidPaths = {keyPaths[0]};
        m_GuidPaths[0].back() = YAMLScalar::guid;
    }

    /// Null if the element has no key.
    const YAMLScalar* Of(const YAMLNode* element) const {
        if (m_KeyPaths.size() == 1) {
            const YAMLScalar* value = ScalarAt(m_KeyPaths[0], element);
            if (!value || m_GuidPaths.empty() || !ScalarAt(m_GuidPaths[0], element)) return value;
        }
        const auto values = MergeRules::GetUniqueMappingValues(m_KeyPaths, element);
        if (values.empty()) return nullptr;
        const auto guid = MergeRules::GetUniqueMappingValues(m_GuidPaths, element);
        std::string text = CollapseKeyElementValues(values);
        if (!guid.empty()) text.append(":").append(guid[0]->Value());
        return YAMLScalar::Lookup(text);
    }

private:
    static const YAMLScalar* ScalarAt(const Path& path, const YAMLNode* element) {
        return AsScalar(MergeRules::GetYAMLNodeFieldByPath(element, path));
    }

    const std::vector<Path>& m_KeyPaths;
    std::vector<Path> m_GuidPaths;
};

std::unique_ptr<KeyIndex> IndexTexts(const NodeList& texts) {
    auto indexes = std::make_unique<KeyIndex>();
    indexes->Reserve(texts.size());
    for (std::size_t i = 0; i < texts.size(); ++i)
        indexes->Set(AsScalar(texts[i]), static_cast<std::uint32_t>(i));
    return indexes;
}

/// False if an element has no key or two have the same.
bool IndexUniqueKeys(const ElementKeys& keys, const NodeList& items, KeyIndex& indexes) {
    indexes.Reserve(items.size());
    for (std::size_t i = 0; i < items.size(); ++i) {
        const YAMLScalar* key = keys.Of(items[i]);
        if (!key || !indexes.Insert(key, static_cast<std::uint32_t>(i))) return false;
    }
    return true;
}

/// Maps what `indexes` knows of the keys of the base. False if an element has no key or two have the same.
bool MapUniqueKeys(const ElementKeys& keys, const NodeList& items, const KeyIndex& indexes,
                   std::vector<int>& mapping) {
    KeyIndex added;
    for (std::size_t i = 0; i < items.size(); ++i) {
        const YAMLScalar* key = keys.Of(items[i]);
        if (!key) return false;
        const std::uint32_t inBase = indexes.Find(key);
        if (inBase == KeyIndex::kMissing) {
            if (!added.Insert(key, static_cast<std::uint32_t>(i))) return false;
            continue;
        }
        if (mapping[inBase] != -1) return false;
        mapping[inBase] = static_cast<int>(i);
    }
    return true;
}

int IndexOf(const KeyIndex& indexes, const YAMLScalar* key) {
    const std::uint32_t index = key ? indexes.Find(key) : KeyIndex::kMissing;
    return index == KeyIndex::kMissing ? -1 : static_cast<int>(index);
}

YAMLSequenceRemapper* UnlessIdentity(YAMLSequenceRemapper* remapper) {
    if (!remapper->IsIdentity()) return remapper;
    YAMLAlloc<YAMLSequenceRemapper>::free(remapper);
    return nullptr;
}

} // namespace

YAMLSequenceRemapper* FindMapping(const DiffContext& context, const YAMLSequence* base,
                                  const YAMLSequence* dest) {
    const ListRule& rule = context.rules.SelectKeyPaths(context.path);
    if (rule.kind == SequenceType::Plain) return FindGenericMapping(base, dest);
    const ElementKeys keys(rule.keys);
    KeyIndex inBase;
    if (!IndexUniqueKeys(keys, base->m_Items, inBase)) return FindGenericMapping(base, dest);
    YAMLSequenceRemapper* remapper =
        YAMLAlloc<YAMLSequenceRemapper>::create(base->m_Items.size(), dest->m_Items.size(), true);
    if (MapUniqueKeys(keys, dest->m_Items, inBase, remapper->m_Mapping)) return UnlessIdentity(remapper);
    YAMLAlloc<YAMLSequenceRemapper>::free(remapper);
    return FindGenericMapping(base, dest);
}

YAMLSequenceRemapper* FindKeyListMapping(const YAMLSequence* base, const YAMLSequence* dest,
                                         const YAMLMapping& mapping) {
    const auto& from = base->m_Items;
    const auto& to = dest->m_Items;
    YAMLSequenceRemapper* remapper = YAMLAlloc<YAMLSequenceRemapper>::create(from.size(), to.size(), true);
    // A mapping knows where its keys stand, but not how many of those in front of them were removed.
    const bool hasHoles = mapping.RawEntries().size() != to.size();
    std::unique_ptr<KeyIndex> indexes;
    const auto indexOf = [&](const YAMLScalar* key) {
        if (!hasHoles) return mapping.Find(key);
        if (!indexes) indexes = IndexTexts(to);
        return indexes->Find(key);
    };
    std::size_t next = 0;
    for (std::size_t i = 0; i < from.size(); ++i) {
        // Most keys stand behind the one that they stood behind.
        if (next == to.size() || to[next] != from[i]) {
            const std::uint32_t found = indexOf(AsScalar(from[i]));
            if (found == KeyIndex::kMissing) continue;
            next = found;
        }
        remapper->m_Mapping[i] = static_cast<int>(next++);
    }
    return UnlessIdentity(remapper);
}

YAMLSequenceRemapper* FindGenericMapping(const YAMLSequence* base, const YAMLSequence* dest) {
    const auto& from = base->m_Items;
    const auto& to = dest->m_Items;
    const std::size_t n = from.size(), m = to.size(), common = std::min(n, m);
    std::size_t prefix = 0;
    while (prefix < common && from[prefix]->Equals(to[prefix])) ++prefix;
    if (n == m && prefix == n) return nullptr;
    std::size_t suffix = 0;
    while (suffix < common && from[n - 1 - suffix]->Equals(to[m - 1 - suffix])) ++suffix;

    YAMLSequenceRemapper* remapper = YAMLAlloc<YAMLSequenceRemapper>::create(n, m, false);
    auto& mapping = remapper->m_Mapping;
    for (std::size_t i = 0; i < prefix; ++i) mapping[i] = static_cast<int>(i);
    // Where the two overlap, the suffix stands.
    for (std::size_t t = 0; t < suffix; ++t) mapping[n - 1 - t] = static_cast<int>(m - 1 - t);
    if (m - suffix > prefix && n - suffix > prefix) {
        EqualityMatcher matcher(to, prefix, m - suffix);
        for (std::size_t i = prefix; i < n - suffix; ++i) mapping[i] = matcher.TakeFirstEqual(from[i]);
    }
    return UnlessIdentity(remapper);
}

YAMLSequenceRemapper* FindIdMapping(const std::vector<Path>& keyPaths, const YAMLSequence* first,
                                    const YAMLSequence* second) {
    const ElementKeys keys(keyPaths);
    KeyIndex indexes;
    for (std::size_t i = 0; i < second->m_Items.size(); ++i)
        if (const YAMLScalar* key = keys.Of(second->m_Items[i]))
            indexes.Set(key, static_cast<std::uint32_t>(i));
    YAMLSequenceRemapper* remapper =
        YAMLAlloc<YAMLSequenceRemapper>::create(first->m_Items.size(), second->m_Items.size(), true);
    for (std::size_t i = 0; i < first->m_Items.size(); ++i)
        remapper->m_Mapping[i] = IndexOf(indexes, keys.Of(first->m_Items[i]));
    return remapper;
}

} // namespace ovrin_yaml
