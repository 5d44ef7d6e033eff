#pragma once

#include "Merge/RecordingConflictResolver.h"

#include <iosfwd>
#include <span>
#include <string>
#include <vector>

namespace ovrin_yaml {

/// The report of a merge and the file of decisions for the next one share one format:
///
///     Conflicts:
///     Left  1234.Transform.m_LocalPosition.x change to 1      both sides of a pending conflict
///     ...                                                     (second line of a plain scalar's text)
///     Right 1234.Transform.m_LocalPosition.x change to 2
///     ...
///     Conflict handling:
///     Right 1234.Transform.m_LocalPosition.y                  decisions: Left, Right or Base and a path
///     Non-conflicts:                                          only when asked for
///     Left changes 1234.Transform.m_Name change to Hero
extern const char* const kConflictHeader;
extern const char* const kConflictHandlingHeader;
extern const char* const kNonConflictHandlingHeader;

/// Cuts a text at every ".", empty pieces included; an empty text is the empty path.
Path StringToPath(const std::string& text);

/// Writes the report: pending conflicts, the decisions as they were read, and with `describe` all other
/// records but those of changes on both sides. Records stand in the order of their paths.
void OutputConflictRecords(std::ostream& out, const RecordingConflictResolver& resolver, bool describe);

/// The pending conflicts among the records, in the order of the report.
std::vector<const RecordingConflictResolver::Record*>
PendingByPath(std::span<const RecordingConflictResolver::Record> records);

/// Reads decisions. Only the lines of the section "Conflict handling:" count, up to "Non-conflicts:".
/// Throws std::runtime_error for a line that it can't make out.
std::vector<RecordResolve> ReadDecisions(std::istream& in);

} // namespace ovrin_yaml
