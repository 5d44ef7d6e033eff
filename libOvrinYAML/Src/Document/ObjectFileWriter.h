#pragma once

#include "Document/YAMLMapping.h"

#include <string>

namespace ovrin_yaml {

/// Appends the body of an object as YAML, without the data of its header and without a final line break. What
/// stands below the object's own keys may repeat keys. Throws the duplicate-keys text if those do.
void AppendObjectBody(const YAMLMapping& object, std::string& text);

} // namespace ovrin_yaml
