#pragma once

#include "Values/YAMLMapping.h"

#include <string>

namespace ovrin_fuzz {

/// Whether what is noted of the objects of a root for the repair stages (YAMLMapping::Traits) is true of
/// them, found by looking at everything each time. Returns the first that isn't, or an empty text.
std::string CheckTraits(const ovrin_yaml::YAMLMapping& root);

} // namespace ovrin_fuzz
