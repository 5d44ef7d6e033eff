#include "TreeComparison.h"

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <vector>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// "what: 1 and 2" for two values that are not the same.
template <class Value>
std::string Unless(bool same, const char* what, const Value& left, const Value& right) {
    if (same) return "";
    return std::string(" ") + what + ": " + std::to_string(left) + " and " + std::to_string(right);
}

/// The hash of a root is only known where all of its objects were built when it was read; that no other is
/// missing is CheckTree's to see.
std::string CompareContainers(const YAMLNode& left, const YAMLNode& right, bool leftFlow, bool rightFlow) {
    return Unless(leftFlow == rightFlow, "flow", leftFlow, rightFlow) +
           Unless(left.m_Hash == right.m_Hash || !left.m_Hash || !right.m_Hash, "hash", left.m_Hash,
                  right.m_Hash) +
           Unless(left.m_Line == right.m_Line, "line", left.m_Line, right.m_Line);
}

std::vector<YAMLMapping::Entry> EntriesOf(const YAMLMapping& mapping) {
    std::vector<YAMLMapping::Entry> entries;
    for (const YAMLMapping::Entry entry : mapping.RawEntries())
        if (entry.key) entries.push_back(entry);
    return entries;
}

std::string CompareMappings(const YAMLMapping& left, const YAMLMapping& right) {
    const auto leftEntries = EntriesOf(left), rightEntries = EntriesOf(right);
    std::string difference =
        CompareContainers(left, right, left.m_Flow, right.m_Flow) +
        Unless(left.HasDuplicates() == right.HasDuplicates(), "repeated keys", left.HasDuplicates(),
               right.HasDuplicates()) +
        Unless(leftEntries.size() == rightEntries.size(), "size", leftEntries.size(), rightEntries.size());
    for (std::size_t i = 0; difference.empty() && i < leftEntries.size(); ++i) {
        const std::string key(leftEntries[i].key->Value());
        if (leftEntries[i].key != rightEntries[i].key)
            return " keys: '" + key + "' and '" + std::string(rightEntries[i].key->Value()) + "'";
        difference = FirstDifference(*leftEntries[i].value, *rightEntries[i].value);
        if (!difference.empty()) return "." + key + difference;
    }
    return difference;
}

std::string CompareSequences(const YAMLSequence& left, const YAMLSequence& right) {
    std::string difference = CompareContainers(left, right, left.m_Flow, right.m_Flow) +
                             Unless(left.m_Items.size() == right.m_Items.size(), "size", left.m_Items.size(),
                                    right.m_Items.size());
    for (std::size_t i = 0; difference.empty() && i < left.m_Items.size(); ++i) {
        difference = FirstDifference(*left.m_Items[i], *right.m_Items[i]);
        if (!difference.empty()) return "." + std::to_string(i) + difference;
    }
    return difference;
}

} // namespace

std::string FirstDifference(const YAMLNode& left, const YAMLNode& right) {
    if (left.GetKind() != right.GetKind())
        return Unless(false, "kind", static_cast<int>(left.GetKind()), static_cast<int>(right.GetKind()));
    if (const YAMLMapping* mapping = AsMapping(&left)) return CompareMappings(*mapping, *AsMapping(&right));
    if (const YAMLSequence* sequence = AsSequence(&left))
        return CompareSequences(*sequence, *AsSequence(&right));
    if (&left == &right) return "";
    return " texts: '" + std::string(AsScalar(&left)->Value()) + "' and '" +
           std::string(AsScalar(&right)->Value()) + "'";
}

} // namespace ovrin_fuzz
