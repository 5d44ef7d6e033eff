#pragma once

#include "MergeInput.h"

#include <string>

namespace ovrin_fuzz {

/// Merges the files in every way to read them: with the library alone, with the reader for the written form,
/// with shared objects, one file after the other and all at once, on threads and without. All must give the
/// same, all trees and diffs must keep their invariants, and the laws of merges (CheckLaws) must hold for
/// each side. Returns the first finding, or an empty text.
std::string CheckMerge(const MergeTexts& texts);

} // namespace ovrin_fuzz
