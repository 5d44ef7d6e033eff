#pragma once

#include <string>

namespace ovrin {

/// The four files of a merge as version control gives them to a merge tool. A base that is missing or empty
/// stands for a scene without objects.
struct ToolFiles {
    std::string base, ours, theirs, result;
};

/// Lets the external merge tool of the merge spec file show what is left of the conflicts; it may take the
/// terminal. The result is replaced only by a whole one. Throws Failure if the tool leaves none.
void MergeWithTool(const ToolFiles& files);

} // namespace ovrin
