#pragma once

#include "Values/YAMLNode.h"

#include <string>

namespace ovrin_fuzz {

/// The first difference between two trees, with the path to it; empty if there is none. Compared is all that
/// a reader makes: kinds, keys and their order, repeated-key states, scalars by identity, flow flags, hashes,
/// and the lines of containers.
std::string FirstDifference(const ovrin_yaml::YAMLNode& left, const ovrin_yaml::YAMLNode& right);

} // namespace ovrin_fuzz
