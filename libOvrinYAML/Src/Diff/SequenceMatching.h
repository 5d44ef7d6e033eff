#pragma once

#include "Diff/DiffContext.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Values/YAMLSequence.h"

#include <vector>

namespace ovrin_yaml {

class YAMLMapping;

/// The map that brings `base` into the order of `dest`, by key where every element of both has a key of its
/// own, by equality otherwise; null if every element stays where it is. The path chooses the rule.
YAMLSequenceRemapper* FindMapping(const DiffContext& context, const YAMLSequence* base,
                                  const YAMLSequence* dest);

/// The same for two lists of the keys of mappings, of which `dest` has that of `mapping`.
YAMLSequenceRemapper* FindKeyListMapping(const YAMLSequence* base, const YAMLSequence* dest,
                                         const YAMLMapping& mapping);

/// The same by equality: a common prefix and suffix, which may overlap, and between them each base element
/// with the first equal destination element that is still free.
YAMLSequenceRemapper* FindGenericMapping(const YAMLSequence* base, const YAMLSequence* dest);

/// Lenient matching by key, from indexes of `first` to indexes of `second`. An element without a key stays
/// unmatched and of a repeated key in `second` the last one counts. Never null.
YAMLSequenceRemapper* FindIdMapping(const std::vector<Path>& keyPaths, const YAMLSequence* first,
                                    const YAMLSequence* second);

} // namespace ovrin_yaml
