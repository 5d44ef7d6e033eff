#pragma once

#include "Changes/FileChange.h"

#include <span>
#include <string>

namespace ovrin {

/// What changed in a file, for a terminal: a headline, then object by object. Every line ends in a line
/// break.
///
///     scenes/Harbour.ovrin
///       changed  Harbour/Lantern · Light (734812)
///                  m_Intensity: 4 → 5
///       added    Harbour/Hook (99)
///       moved    Harbour/Boat (55), from Dock
std::string ChangeText(const FileChange& change, bool inColour);

/// A diff by lines, in the colours that git has for it.
std::string PaintedLines(const std::string& lines, bool inColour);

/// The counts of files, one line each, and their sum.
///
///     scenes/Harbour.ovrin | 1 added, 1 changed, 1 moved
///     1 scene: 1 added, 1 changed, 1 moved
std::string ChangeStat(std::span<const FileChange> changes, bool inColour);

/// "renamed from a.ovrin", "added"; empty for a file that just changed.
std::string StatusText(const FilePair& file);

} // namespace ovrin
