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

#include <map>
#include <memory>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// Objects that differ in their headers alone count as equal, since hashes leave these entries out.
bool IsHeaderEntry(const YAMLScalar* key) {
    return key == YAMLScalar::fileIDPlaceHolderName || key == YAMLScalar::classIDPlaceHolderName ||
           key == YAMLScalar::strippedPrefabPlaceHolderName;
}

enum class KeyOrder { Counts, CountsNot };

/// The hash of all that stands in a node now.
std::uint32_t ContentHash(const YAMLNode& node, KeyOrder order = KeyOrder::Counts) {
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        for (const auto& [key, value] : mapping->RawEntries()) {
            if (!key || IsHeaderEntry(key)) continue;
            const std::uint32_t content = ContentHash(*value, order);
            hash = order == KeyOrder::Counts ? FoldPair(hash, key->m_Hash, content, index++)
                                             : hash + FoldPair(0, key->m_Hash, content, 0);
        }
    } else if (const YAMLSequence* sequence = AsSequence(&node)) {
        for (const YAMLNode* item : sequence->m_Items)
            hash = FoldItem(hash, ContentHash(*item, order), index++);
    } else {
        hash = node.m_Hash;
    }
    return hash;
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

using Contents = std::map<std::string, std::uint32_t>;

Contents ContentsOf(const YAMLMapping& root, KeyOrder order) {
    Contents contents;
    for (const auto& [id, object] : root) contents.emplace(id->Value(), ContentHash(*object, order));
    return contents;
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
        const Contents expected = ContentsOf(changed, order);
        const Contents actual = ContentsOf(merged->GetMapping(), order);
        if (actual.size() != expected.size()) return which + " has other objects";
        for (const auto& [id, hash] : expected)
            if (!actual.contains(id) || actual.at(id) != hash) return which + " has another object " + id;
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
