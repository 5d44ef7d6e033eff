#include "Writing/CheckTree.h"

#include "Values/Hash.h"
#include "Values/OvrinObjects.h"
#include "Values/ScalarTable.h"
#include "Values/YAMLSequence.h"
#include "Writing/ObjectFileWriter.h"
#include "Writing/WrittenForm.h"

#include <sstream>

namespace ovrin_yaml {

/// One check of a tree, with the path to where it is. Each function returns a fault, or an empty text.
class TreeCheck {
public:
    std::string CheckRoot(const YAMLMapping& root, TreeStage stage);

private:
    std::string CheckObject(const YAMLNode* value, TreeStage stage);
    std::string Check(const YAMLNode* node, bool withHashes);
    std::string CheckBelow(const std::string& step, const YAMLNode* node, bool withHashes);
    std::string CheckScalar(const YAMLScalar& scalar) const;
    std::string CheckMapping(const YAMLMapping& mapping, bool withHashes);
    std::string CheckSequence(const YAMLSequence& sequence, bool withHashes);
    std::string CheckKeys(const YAMLMapping& mapping) const;
    std::string CheckIndex(const YAMLMapping& mapping) const;
    std::string CheckHash(const YAMLMapping& mapping) const;
    std::string CheckSource(const YAMLMapping& object) const;

    std::string Fault(const std::string& what) const { return m_Path + ": " + what; }

    std::string m_Path;
};

namespace {

bool IsHeaderEntry(const YAMLScalar* key) {
    return key == YAMLScalar::fileIDPlaceHolderName || key == YAMLScalar::classIDPlaceHolderName ||
           key == YAMLScalar::strippedPrefabPlaceHolderName;
}

/// The object as the writer gives it, from "---" on.
std::string WrittenAlone(const YAMLMapping& object) {
    OvrinObjects alone;
    alone.GetMapping().Append(YAMLScalar::zero, CopyExactly(&object));
    std::ostringstream stream;
    Output(alone, stream);
    const std::string written = stream.str();
    return written.substr(written.find(kDocumentMark));
}

} // namespace

std::string TreeCheck::CheckRoot(const YAMLMapping& root, TreeStage stage) {
    std::string fault = CheckKeys(root);
    for (const YAMLMapping::Entry entry : root.RawEntries()) {
        if (!fault.empty()) break;
        if (!entry.key) continue;
        m_Path = entry.key->Value();
        fault = CheckObject(entry.value, stage);
    }
    return fault;
}

std::string TreeCheck::CheckObject(const YAMLNode* value, TreeStage stage) {
    const YAMLMapping* object = AsMapping(value);
    const bool isUnchanged = object && object->IsKnownUnchanged();
    const std::string fault = Check(value, stage == TreeStage::Hashed || isUnchanged);
    return fault.empty() && object ? CheckSource(*object) : fault;
}

std::string TreeCheck::Check(const YAMLNode* node, bool withHashes) {
    if (!node) return Fault("no value");
    if (const YAMLMapping* mapping = AsMapping(node)) return CheckMapping(*mapping, withHashes);
    if (const YAMLSequence* sequence = AsSequence(node)) return CheckSequence(*sequence, withHashes);
    return CheckScalar(*AsScalar(node));
}

std::string TreeCheck::CheckBelow(const std::string& step, const YAMLNode* node, bool withHashes) {
    const std::size_t length = m_Path.size();
    m_Path += "." + step;
    std::string fault = Check(node, withHashes);
    m_Path.resize(length);
    return fault;
}

std::string TreeCheck::CheckScalar(const YAMLScalar& scalar) const {
    if (YAMLScalar::Lookup(scalar.Value()) != &scalar) return Fault("a scalar that isn't the interned one");
    if (scalar.m_Hash != ScalarTable::HashOf(scalar.Value())) return Fault("another hash than its text's");
    return "";
}

std::string TreeCheck::CheckMapping(const YAMLMapping& mapping, bool withHashes) {
    std::string fault = CheckKeys(mapping);
    for (const YAMLMapping::Entry entry : mapping.RawEntries())
        if (fault.empty() && entry.key)
            fault = CheckBelow(std::string(entry.key->Value()), entry.value, withHashes);
    return fault.empty() && withHashes ? CheckHash(mapping) : fault;
}

std::string TreeCheck::CheckSequence(const YAMLSequence& sequence, bool withHashes) {
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    for (const YAMLNode* item : sequence.m_Items) {
        std::string fault = CheckBelow(std::to_string(index), item, withHashes);
        if (!fault.empty()) return fault;
        hash = FoldItem(hash, item->m_Hash, index++);
    }
    return withHashes && hash != sequence.m_Hash ? Fault("a hash that isn't that of the items") : "";
}

std::string TreeCheck::CheckKeys(const YAMLMapping& mapping) const {
    std::size_t removed = 0;
    for (const YAMLMapping::Entry entry : mapping.RawEntries()) {
        removed += !entry.key;
        if (!entry.key && entry.value) return Fault("a value without a key");
        std::string fault = entry.key ? CheckScalar(*entry.key) : "";
        if (!fault.empty()) return fault;
    }
    if (removed != mapping.RemovedCount())
        return Fault(std::to_string(removed) + " removed pairs, of which " +
                     std::to_string(mapping.RemovedCount()) + " are counted");
    if (!mapping.HasDuplicates()) return CheckIndex(mapping);
    return mapping.Index() || removed ? Fault("repeated keys beside an index or removed pairs") : "";
}

std::string TreeCheck::CheckIndex(const YAMLMapping& mapping) const {
    if (!mapping.Index() && mapping.m_Size > KeyIndex::kSearchLimit)
        return Fault("many keys without an index");
    if (!mapping.Index() && mapping.RemovedCount()) return Fault("removed pairs without an index");
    for (std::uint32_t i = 0; i < mapping.m_Size; ++i) {
        const YAMLScalar* key = mapping.m_Keys[i];
        if (key && mapping.Find(key) != i)
            return Fault("the key '" + std::string(key->Value()) + "' isn't found where it stands");
    }
    return "";
}

/// The header's entries stand at the end, and every hash without some of them may be the reader's: a key of
/// the body may have the name of one.
std::string TreeCheck::CheckHash(const YAMLMapping& mapping) const {
    const bool coversMore = mapping.m_Extra && mapping.m_Extra->leftOut;
    if (coversMore || (mapping.HasDuplicates() && mapping.m_Hash == 0)) return "";
    std::uint32_t hash = 0;
    std::uint32_t index = 0;
    bool isReaders = false;
    for (const YAMLMapping::Entry entry : mapping.RawEntries()) {
        if (!entry.key) continue;
        isReaders = IsHeaderEntry(entry.key) && (isReaders || hash == mapping.m_Hash);
        hash = FoldPair(hash, entry.key->m_Hash, entry.value->m_Hash, index++);
    }
    return isReaders || hash == mapping.m_Hash ? "" : Fault("a hash that isn't that of the pairs");
}

std::string TreeCheck::CheckSource(const YAMLMapping& object) const {
    if (object.Source().empty()) return "";
    const std::string written = WrittenAlone(object);
    if (written == object.Source()) return "";
    return Fault("the source bytes\n" + std::string(object.Source()) + "are written as\n" + written);
}

std::string CheckTree(const YAMLMapping& root, TreeStage stage) {
    return TreeCheck().CheckRoot(root, stage);
}

} // namespace ovrin_yaml
