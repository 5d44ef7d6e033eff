#include "Diff/CheckDiff.h"

#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"

#include <unordered_set>

namespace ovrin_yaml {

namespace {

/// One check of a diff. Each function returns a fault, or an empty text.
class DiffCheck {
public:
    explicit DiffCheck(DiffOrigin origin) : m_Origin(origin) {}

    std::string Check(const YAMLMappingDiff& diff);

private:
    std::string CheckAt(const std::string& step, const Operation* operation);
    std::string CheckOperation(const Operation* operation);
    std::string CheckSequence(const ChangeSequenceOperation& change);
    std::string CheckPlaces(const YAMLSequenceRemapper& remapper, const YAMLSequenceDiff& diff) const;

    std::string Fault(const std::string& what) const { return m_Path + ": " + what; }

    const DiffOrigin m_Origin;
    std::string m_Path;
};

std::string DiffCheck::Check(const YAMLMappingDiff& diff) {
    std::unordered_set<const YAMLScalar*> keys;
    std::string fault = diff.m_KeyOrder ? CheckAt("_", diff.m_KeyOrder) : "";
    for (const auto& [key, operation] : diff.Entries()) {
        if (!fault.empty()) break;
        if (!keys.insert(key).second || diff.Find(key) != operation)
            return Fault("two operations for " + std::string(key->Value()));
        fault = CheckAt(std::string(key->Value()), operation);
    }
    return fault;
}

std::string DiffCheck::CheckAt(const std::string& step, const Operation* operation) {
    const std::size_t length = m_Path.size();
    m_Path += "." + step;
    std::string fault = CheckOperation(operation);
    m_Path.resize(length);
    return fault;
}

std::string DiffCheck::CheckOperation(const Operation* operation) {
    if (!operation) return Fault("no operation");
    switch (operation->GetKind()) {
    case Operation::Kind::Remove:
        return "";
    case Operation::Kind::Change:
    case Operation::Kind::Add:
        return static_cast<const ValuedOperation*>(operation)->m_Value ? "" : Fault("no value");
    case Operation::Kind::ChangeMapping:
        return Check(*As<ChangeMappingOperation>(operation)->m_Diff);
    case Operation::Kind::ChangeSequence:
        break;
    }
    return CheckSequence(*As<ChangeSequenceOperation>(operation));
}

std::string DiffCheck::CheckSequence(const ChangeSequenceOperation& change) {
    std::string fault = change.m_Remapper ? CheckPlaces(*change.m_Remapper, *change.m_Diff) : "";
    int last = -1;
    for (const auto& [index, operation] : change.m_Diff->Entries()) {
        if (!fault.empty()) break;
        if (index <= last) return Fault("entries that don't ascend");
        last = index;
        fault = CheckAt(std::to_string(index), operation);
    }
    return fault;
}

std::string DiffCheck::CheckPlaces(const YAMLSequenceRemapper& remapper, const YAMLSequenceDiff& diff) const {
    std::vector<bool> isFilled(remapper.m_DestinationCount);
    for (const int target : remapper.m_Mapping) {
        if (target == -1) continue;
        if (target < 0 || static_cast<std::size_t>(target) >= isFilled.size())
            return Fault("an element goes to " + std::to_string(target) + " of " +
                         std::to_string(isFilled.size()));
        isFilled[static_cast<std::size_t>(target)] = true;
    }
    if (m_Origin == DiffOrigin::Sides) return "";
    for (const auto& [index, operation] : diff.Entries()) {
        if (static_cast<std::size_t>(index) >= isFilled.size())
            return Fault("a change beyond the destination");
        if (As<AddOperation>(operation)) isFilled[static_cast<std::size_t>(index)] = true;
    }
    for (std::size_t i = 0; i < isFilled.size(); ++i)
        if (!isFilled[i]) return Fault("nothing for place " + std::to_string(i));
    return "";
}

} // namespace

std::string CheckDiff(const YAMLMappingDiff& diff, DiffOrigin origin) {
    return DiffCheck(origin).Check(diff);
}

} // namespace ovrin_yaml
