#pragma once

#include "Names/ObjectBody.h"

#include <string>

namespace ovrin {

/// The pieces that names are made of, all printable and of bounded length.

/// A name as it stands in an object; "(no name)" for one that is blank or isn't there.
std::string OwnName(const ovrin_yaml::YAMLScalar* name);
/// The first letters of a guid.
std::string ShortGuid(const ovrin_yaml::YAMLScalar* guid);
/// "Light", "MonoBehaviour 4f0c2b7d".
std::string ClassLabel(const ObjectBody& body);
/// The own name of a GameObject or a prefab instance: "Lantern", "PrefabInstance c5a81f3e".
std::string PlaceLabel(const ObjectBody& body);
/// Class and name of an object outside of the hierarchy: "Material Rust".
std::string PlainLabel(const ObjectBody& body);
/// "(missing 12)".
std::string MissingLabel(const ovrin_yaml::YAMLScalar* id);

} // namespace ovrin
