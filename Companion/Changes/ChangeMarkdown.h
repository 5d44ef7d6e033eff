#pragma once

#include "Changes/FileChange.h"

#include <span>
#include <string>

namespace ovrin {

/// What changed, as Markdown for a pull request. Names and values stand in code spans, so that nothing in
/// them is markup or a mention. Files that are no scenes are counted.
std::string ChangeMarkdown(std::span<const FileChange> changes);

} // namespace ovrin
