#pragma once

#include "Checks/Finding.h"

#include "Repair/YAMLTypeInfo.h"

#include <string>
#include <vector>

namespace ovrin {

/// What is wrong with the bytes of a scene, by lines. Throws std::bad_alloc only.
std::vector<Finding> CheckScene(const std::string& bytes, const ovrin_yaml::YAMLTypeInfoManager& types);

} // namespace ovrin
