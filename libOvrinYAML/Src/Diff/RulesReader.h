#pragma once

#include "Values/YAMLScalar.h"

#include <iosfwd>
#include <string>

namespace ovrin_yaml {

class MergeRules;

/// Appends the rules of a rules file to `rules`:
///
///     # a comment, or an empty line
///     [arrays]
///     set PATH KEYPATH...               elements are matched by key
///     plain PATH                        elements are matched by equality
///     [exclusions]
///     include PATH                      both sides' changes below PATH are combined
///     exclude PATH                      they conflict
///     includeIfContains PATH FIELDPATH...
///     excludeIfContains PATH FIELDPATH...
///     [comparisons]
///     float PATH [RELATIVE [ABSOLUTE]]  a tolerance
///     [premerge]
///     legacyBlankPremergeBase
///
/// Only blanks separate tokens, and the elements of a path are joined by dots. Sections may come in any order
/// and again.
///
/// Throws std::runtime_error with the number of the first bad line; the rules above it stay.
void LoadSequenceUniqueKeys(std::istream& in, MergeRules& rules);

/// The path of a rule: the pieces of `text` between dots, empty ones left out.
Path ToRulePath(const std::string& text);

} // namespace ovrin_yaml
