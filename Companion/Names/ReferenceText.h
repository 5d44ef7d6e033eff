#pragma once

#include "Names/ObjectNames.h"

#include <string>

namespace ovrin {

/// Whether a value is a reference and nothing else: a mapping of a file id, and guid and type beside it.
bool IsReference(const ovrin_yaml::YAMLNode& value);

/// A reference for a person: "→ Harbour/Pier (12)", "→ file 4f0c2b7d (2100000)", "none".
std::string ReferenceText(const Reference& reference, const ObjectNames& names);

} // namespace ovrin
