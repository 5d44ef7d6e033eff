#pragma once

#include "Preview/Answer.h"

#include <string>

namespace ovrin {

/// "1 scene", "2 scenes".
std::string Counted(std::size_t count, const std::string& thing);

/// One line without its end: "12 scenes changed on both sides, 3 would conflict: Pier.ovrin, ...".
std::string SummaryLine(const PreviewAnswer& answer);

/// Whether a person is to be told of the scene.
bool IsTold(const PreviewedScene& scene);

/// What is told of it on one line: "2 conflicts", or what git can't settle.
std::string SceneWords(const PreviewedScene& scene);

/// The answer for a terminal: each scene that a person must look at with its conflicts, and the summary.
std::string ToText(const PreviewAnswer& answer);

/// What is to be told about scenes that version control merges by lines; empty if there are none.
std::string ByLinesWords(const PreviewAnswer& answer);

} // namespace ovrin
