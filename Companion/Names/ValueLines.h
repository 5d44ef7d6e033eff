#pragma once

#include "Names/ObjectNames.h"

#include <string>
#include <vector>

namespace ovrin {

/// A whole value in lines, for faces that scroll. Mappings and lists that the file has in block form take a
/// line for each entry, indented by two blanks a level, and a text of several lines has them as they are. All
/// else is as in ValueLine, and nothing is shortened.
std::vector<std::string> ValueLines(const ovrin_yaml::YAMLNode& value, const ObjectNames& names);

} // namespace ovrin
