#pragma once

#include <string>

namespace ovrin_fuzz {

/// Checks what holds for every base and every changed file, before the repair stages:
///
///     merge(base, base, changed) = changed      merge(base, changed, base) = changed
///     merge(base, changed, changed) = changed
///
/// without a conflict, object by object; the order of the objects is the merge's own. Two objects are the
/// same if hashes of all that stands in them are, since equal hashes count as equal content. The exceptions:
///  - files that can't be read or pre-processed, that repeat keys, or of which the reader dropped a pair;
///  - what stands in the objects' headers, which their hashes leave out;
///  - the order of keys, where somewhere nothing but that differs, which is no difference;
///  - the third law, where an element of a list or a key of a mapping moved past another, or two equal
///    elements became one: equal moves of both sides are lost.
/// Returns what was found to be wrong, or an empty text.
std::string CheckLaws(const std::string& base, const std::string& changed);

} // namespace ovrin_fuzz
