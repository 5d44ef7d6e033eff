#pragma once

#include "Values/OvrinObjects.h"
#include "Values/YAMLScalar.h"

#include <set>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {

/// What the editor says about one of its classes. Ids are the numbers of document headers, as scalars.
///
///     - id: 501
///       name: Wheel
///       ismulti: 0                 1: an object may have several
///       baseid: 2                  the class it derives from
///       requires: f4010000         classes that must stand beside it, here 500
///       conflicts:                 classes that must not
struct YAMLTypeInfo {
    const YAMLScalar* m_ID = nullptr;
    const YAMLScalar* m_BaseID = nullptr;
    const YAMLScalar* m_Name = nullptr;
    bool m_IsMulti = false;
    std::vector<const YAMLScalar*> m_Requires;  // each once, by ascending number
    std::vector<const YAMLScalar*> m_Conflicts; // likewise

    /// Fills the record from an entry of the file; null or a missing field is a failure. Throws
    /// std::runtime_error "Cannot read ", the field and " in YAMLTypeInfo file".
    void Read(const YAMLMapping* mapping);
};

/// The type information of a merge, by class id. A value: filled first, then only read, by any number of
/// threads.
class YAMLTypeInfoManager {
public:
    /// Takes the list MergeTypeInfo of the object with file id 1, in place of what was read before. Of
    /// entries with one id the first counts. Throws std::runtime_error if there is no such list, or for a bad
    /// entry.
    void Read(const OvrinObjects& objects);
    /// The same from the object, which may be null.
    void Read(const YAMLMapping* mapping);

    /// Whether a file was read.
    bool IsLoaded() const { return m_IsLoaded; }
    /// The type, owned by the manager, or null if the class is unknown; `id` may be null.
    const YAMLTypeInfo* GetTypeInfo(const YAMLScalar* id) const;

private:
    std::unordered_map<const YAMLScalar*, YAMLTypeInfo> m_Types;
    bool m_IsLoaded = false;
};

/// Adds the numbers of a compact set: 8 hexadecimal digits each, a 32-bit integer with its lowest byte first,
/// so that "72000000" is 114. What is left behind the last whole group is ignored. Digits are not validated:
/// below ':' a character counts as 0 to 9, below '[' as upper case, from there on as lower case.
void ReadCompactSerializedSet(std::string_view text, std::set<int>& result);

} // namespace ovrin_yaml
