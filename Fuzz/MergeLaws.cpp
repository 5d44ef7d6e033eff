#include "MergeLaws.h"

#include "ReaderCheck.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Merge/DiffMerge.h"
#include "Merge/RecordingConflictResolver.h"
#include "Reading/ObjectFileReader.h"
#include "Repair/PreProcess.h"
#include "Values/Hash.h"

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// Objects that differ in their headers alone count as equal, since hashes leave these entries out.
bool IsHeaderEntry(const YAMLScalar* key) {
    return key == YAMLScalar::fileIDPlaceHolderName || key == YAMLScalar::classIDPlaceHolderName ||
           key == YAMLScalar::strippedPrefabPlaceHolderName;
}

/// The pairs that count, without those that were removed.
std::vector<YAMLMapping::Entry> PairsOf(const YAMLMapping& mapping) {
    std::vector<YAMLMapping::Entry> pairs;
    for (const YAMLMapping::Entry entry : mapping.RawEntries())
        if (entry.key && !IsHeaderEntry(entry.key)) pairs.push_back(entry);
    return pairs;
}

/// The hash of all that stands in a node now.
std::uint32_t ContentHash(const YAMLNode& node) {
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        for (const auto& [key, value] : PairsOf(*mapping))
            hash = FoldPair(hash, key->m_Hash, ContentHash(*value), index++);
    } else if (const YAMLSequence* sequence = AsSequence(&node)) {
        for (const YAMLNode* item : sequence->m_Items) hash = FoldItem(hash, ContentHash(*item), index++);
    } else {
        hash = node.m_Hash;
    }
    return hash;
}

enum class KeyOrder { Counts, CountsNot };

bool IsSame(const YAMLNode& one, const YAMLNode& other, KeyOrder order);

bool HasSamePairs(const YAMLMapping& one, const YAMLMapping& other) {
    if (one.HasDuplicates() || other.HasDuplicates()) return false;
    const std::vector<YAMLMapping::Entry> pairs = PairsOf(one);
    return pairs.size() == PairsOf(other).size() &&
           std::ranges::all_of(pairs, [&](const YAMLMapping::Entry& pair) {
               const YAMLNode* value = other.Get(pair.key);
               return value && IsSame(*pair.value, *value, KeyOrder::CountsNot);
           });
}

/// Whether two nodes have the same content, or one that differs in nothing but the order of keys. Each level
/// is asked for its hash: two mappings may have another one for their order, and have values that differ and
/// have one.
bool IsSame(const YAMLNode& one, const YAMLNode& other, KeyOrder order) {
    if (ContentHash(one) == ContentHash(other)) return true;
    if (order == KeyOrder::Counts) return false;
    const YAMLMapping *mapping = AsMapping(&one), *otherMapping = AsMapping(&other);
    if (mapping && otherMapping) return HasSamePairs(*mapping, *otherMapping);
    const YAMLSequence *list = AsSequence(&one), *otherList = AsSequence(&other);
    const auto isSame = [](const YAMLNode* item, const YAMLNode* otherItem) {
        return IsSame(*item, *otherItem, KeyOrder::CountsNot);
    };
    return list && otherList && std::ranges::equal(list->m_Items, otherList->m_Items, isSame);
}

/// Whether somewhere in two mappings stand two that differ in nothing but the order of their keys, which is
/// no difference. Any two elements of two lists may be the same element.
bool OnlyKeysMove(const YAMLNode& base, const YAMLNode& changed) {
    if (base.Equals(&changed)) return false;
    const YAMLMapping *from = AsMapping(&base), *to = AsMapping(&changed);
    const YAMLSequence *fromList = AsSequence(&base), *toList = AsSequence(&changed);
    if (from && to) {
        if (YAMLMappingDiff::Diff(MergeRules(), from, to)->Entries().empty()) return true;
        for (const auto& [key, value] : *from)
            if (to->HasKey(key) && OnlyKeysMove(*value, *to->Get(key))) return true;
    } else if (fromList && toList) {
        for (const YAMLNode* item : fromList->m_Items)
            for (const YAMLNode* other : toList->m_Items)
                if (OnlyKeysMove(*item, *other)) return true;
    }
    return false;
}

/// Whether a container has keys that it repeats, or a hash that covers pairs that it hasn't. Not asked of an
/// object itself, whose hash leaves out the header's entries.
bool IsOdd(const YAMLNode& node) {
    if (AsScalar(&node)) return false;
    return node.m_Hash != ContentHash(node);
}

bool RepeatsKeys(const YAMLNode& node) {
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        if (mapping->HasDuplicates()) return true;
        for (const YAMLMapping::Entry entry : *mapping)
            if (RepeatsKeys(*entry.value)) return true;
    } else if (const YAMLSequence* sequence = AsSequence(&node)) {
        for (const YAMLNode* item : sequence->m_Items)
            if (RepeatsKeys(*item)) return true;
    }
    return false;
}

bool IsUsual(const YAMLMapping& root) {
    if (RepeatsKeys(root)) return false;
    for (const YAMLMapping::Entry object : root)
        for (const YAMLMapping::Entry entry : *AsMapping(object.value))
            if (IsOdd(*entry.value)) return false;
    return true;
}

/// Reads and pre-processes a file; null if the laws don't hold for it.
std::unique_ptr<OvrinObjects> Read(const std::string& file) {
    auto objects = std::make_unique<OvrinObjects>();
    try {
        ParseYAMLFile(std::string(file), *objects);
        if (!IsUsual(objects->GetMapping())) return nullptr;
        PreProcess(objects->GetMapping());
    } catch (const YAMLError&) {
        return nullptr;
    }
    return objects;
}

bool Moves(const Operation* operation);

bool Moves(const YAMLMappingDiff& diff) {
    if (diff.m_KeyOrder && Moves(diff.m_KeyOrder)) return true;
    for (const auto& entry : diff.Entries())
        if (Moves(entry.operation)) return true;
    return false;
}

bool Moves(const Operation* operation) {
    if (const auto* mapping = As<ChangeMappingOperation>(operation)) return Moves(*mapping->m_Diff);
    const auto* sequence = As<ChangeSequenceOperation>(operation);
    if (!sequence) return false;
    int last = -1;
    if (sequence->m_Remapper)
        for (const int target : sequence->m_Remapper->m_Mapping) {
            if (target != -1 && target <= last) return true;
            last = std::max(last, target);
        }
    for (const auto& entry : sequence->m_Diff->Entries())
        if (Moves(entry.operation)) return true;
    return false;
}

/// Of the objects alone: their own order doesn't count.
bool MovesInObjects(const YAMLMappingDiff& diff) {
    for (const auto& entry : diff.Entries())
        if (Moves(entry.operation)) return true;
    return false;
}

class Law {
public:
    Law(const std::string& base, const std::string& changed) : m_Base(base), m_Changed(Read(changed)) {}

    std::string Check() const {
        const std::unique_ptr<OvrinObjects> base = Read(m_Base);
        if (!base || !m_Changed) return "";
        const auto* none = YAMLMappingDiff::Diff(m_Rules, &base->GetMapping(), &base->GetMapping());
        const auto* change = YAMLMappingDiff::Diff(m_Rules, &base->GetMapping(), &m_Changed->GetMapping());
        std::string finding = CheckMerge("base, base, changed", *base, none, change);
        if (finding.empty()) finding = CheckMerge("base, changed, base", *base, change, none);
        if (!finding.empty() || MovesInObjects(*change)) return finding;
        return CheckMerge("base, changed, changed", *base, change, change);
    }

private:
    std::string CheckMerge(const std::string& which, OvrinObjects& base, const YAMLMappingDiff* left,
                           const YAMLMappingDiff* right) const {
        const std::unique_ptr<OvrinObjects> merged(base.Clone());
        RecordingConflictResolver resolver(m_Rules, ResolveBase);
        try {
            MergeMappingDiffs(left, right, resolver)->Apply(merged->GetMapping());
        } catch (const YAMLError& error) {
            return which + " fails: " + error.what();
        }
        if (resolver.HasPendingConflicts()) return which + " has a conflict";
        const YAMLMapping& changed = m_Changed->GetMapping();
        const KeyOrder order =
            OnlyKeysMove(base.GetMapping(), changed) ? KeyOrder::CountsNot : KeyOrder::Counts;
        const YAMLMapping& result = merged->GetMapping();
        if (result.Size() != changed.Size()) return which + " has other objects";
        for (const auto& [id, object] : changed) {
            const YAMLNode* actual = result.Get(id);
            if (!actual || !IsSame(*actual, *object, order))
                return which + " has another object " + std::string(id->Value());
        }
        return "";
    }

    const MergeRules m_Rules;
    const std::string& m_Base;
    const std::unique_ptr<OvrinObjects> m_Changed;
};

} // namespace

std::string CheckLaws(const std::string& base, const std::string& changed) {
    return Law(base, changed).Check();
}

} // namespace ovrin_fuzz
