#pragma once

#include "Checks/Outline.h"

#include <string>

namespace ovrin {

/// The outlines of all objects of a scene, on all processors if it is big. Where the fast reader isn't sure
/// of an object, the whole scene goes the way of a merge, which alone decides what it means and what is
/// refused. Throws MergeError for what can't be read.
Outlines ReadOutlines(const std::string& text);

} // namespace ovrin
