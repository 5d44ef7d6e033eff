#pragma once

#include "Values/YAMLNode.h"

#include <cstddef>
#include <span>
#include <vector>

namespace ovrin {

/// What a value is to a person, as its shape tells.
enum class ValueShape {
    Number,    ///< 4.5
    Text,      ///< any other scalar
    Colour,    ///< {r, g, b} or {r, g, b, a}
    Vector,    ///< {x, y}, {x, y, z} or {x, y, z, w}
    Reference, ///< {fileID: 12}, with guid and type beside it or without
    List,      ///< a sequence
    Fields,    ///< any other mapping
    Other,     ///< nothing, or values of several shapes
};

/// "number", "text", "colour", "vector", "reference", "list", "other".
const char* ShapeName(ValueShape shape);

ValueShape ShapeOf(const ovrin_yaml::YAMLNode& value);
/// The one of all values that are there. Numbers and texts together are texts.
ValueShape CommonShape(std::span<const ovrin_yaml::YAMLNode* const> values);

/// The numbers of a number, colour or vector, in the order in which they stand there; none where one of them
/// isn't finite.
std::vector<double> NumbersOf(const ovrin_yaml::YAMLNode& value);
/// Whether two values say the same, whatever is known of their hashes; null is the same as null alone.
bool IsSameValue(const ovrin_yaml::YAMLNode* one, const ovrin_yaml::YAMLNode* other);

} // namespace ovrin
