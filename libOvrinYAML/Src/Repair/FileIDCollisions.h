#pragma once

#include "Values/TaskRunner.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"

#include <vector>

namespace ovrin_yaml {

/// The order of file ids: that of their texts as plain bytes, so that "10" stands before "9".
struct FileIDCompare {
    bool operator()(const YAMLScalar* a, const YAMLScalar* b) const { return a->Value() < b->Value(); }
};

/// The ids that both sides added, in the order of FileIDCompare.
std::vector<const YAMLScalar*>
CreateConflictingFileIDsRemapper(const YAMLMapping& base, const YAMLMapping& left, const YAMLMapping& right);

/// Where the two objects under a conflicting id are of different classes, gives the right one the next free
/// id, up to 19 further, and follows it with all references of the right file; a reference with a guid points
/// into another file and stays. Containers around an id that was rewritten get the hash that reading them
/// would give; that of an object stays without the data of its header. Where there is a `run`, it looks for
/// the references. Throws YAMLError "Cannot create new fileID for conflicting fileID: " and the id if none of
/// the 19 is free, if one of them would pass the integer range, or if the id is no positive number; the right
/// root is then as it was.
void RemapCollidingAddFileIDs(const std::vector<const YAMLScalar*>& conflicts, const YAMLMapping& base,
                              const YAMLMapping& left, YAMLMapping& right, const TaskRunner& run = {});

} // namespace ovrin_yaml
