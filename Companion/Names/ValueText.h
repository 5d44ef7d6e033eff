#pragma once

#include "Names/ObjectNames.h"

#include <cstddef>
#include <string>
#include <vector>

namespace ovrin {

/// A value on one line for a person, of at most `width` characters, or as long as it is where that is 0:
///
///     4.5                              a number, a word
///     "left hand "                     a text with blanks at its ends or of no letter at all
///     the keeper lights…               a text that was shortened
///     {x: 0, y: 1.5, z: 0}             a mapping or list, in flow form
///     → Harbour/Pier (12)              a reference to an object of the file, by name
///     → (missing 12)                   one to nothing
///     none                             {fileID: 0}
///     → file 4f0c2b7d (2100000)        one to another file, by the first letters of its guid, and the id
///     there
///
/// References and texts within mappings and lists are told in the same way. Whatever comes out is printable
/// (Names/PrintableText.h).
std::string ValueLine(const ovrin_yaml::YAMLNode& value, const ObjectNames& names, std::size_t width = 0);

} // namespace ovrin
