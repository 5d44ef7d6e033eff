#pragma once

#include "Checks/Finding.h"
#include "Checks/ObjectChecks.h"
#include "Checks/ObjectTable.h"
#include "Names/ObjectNames.h"

#include "Repair/YAMLTypeInfo.h"
#include "Values/OvrinObjects.h"

#include <span>
#include <string>
#include <unordered_map>
#include <vector>

namespace ovrin {

/// Puts the faults of a scene into words. Reads its trees, for the names of objects: only for scenes that
/// have faults.
class FaultWords {
public:
    /// All must stay. The text can be read, as its outlines were. Throws what reading it throws.
    FaultWords(const std::string& text, const Outlines& outlines,
               const ovrin_yaml::YAMLTypeInfoManager& types);

    /// The findings, by lines.
    std::vector<Finding> Tell(std::span<const ObjectFault> faults);

private:
    using ID = const ovrin_yaml::YAMLScalar*;

    Finding TellOne(const ObjectFault& fault);
    std::string MessageOf(const ObjectFault& fault);
    const std::string& NameOf(ID id);
    std::string TargetName(ID id);
    std::string TypeName(ID classID) const;

    const std::string& m_Text;
    const ovrin_yaml::YAMLTypeInfoManager& m_Types;
    const ObjectTable m_Table;
    ovrin_yaml::OvrinObjects m_Objects;
    const ObjectNames m_Names;
    std::unordered_map<ID, std::string> m_Known; // names that were made
};

} // namespace ovrin
