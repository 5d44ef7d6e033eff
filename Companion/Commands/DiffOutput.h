#pragma once

#include "Changes/FileChange.h"

#include <string>

namespace ovrin {

enum class DiffForm { Text, Stat, Markdown, Json };

/// How changes are shown.
struct DiffLook {
    DiffForm form = DiffForm::Text;
    std::string colour = "auto"; ///< "always", "never"; auto: on a terminal, unless NO_COLOR is set
    bool mayPage = true;
};

/// Compares the files and shows what changed: through the pager on a terminal, else to standard output. Files
/// that can't be compared by objects are shown by lines in the form Text. Throws Failure.
void OutputChanges(const ChangedFiles& changes, const ovrin_yaml::MergeRules& rules, const ChangeWish& wish,
                   const DiffLook& look);

} // namespace ovrin
