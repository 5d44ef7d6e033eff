#include "Usage.h"

#include <iostream>

namespace {

// Lines may end in a blank, which is why this is no raw string.
const char* const kUsageLines[] = {
    "Ovrin YAML Merge Tool for scene or prefab files - version " OVRIN_VERSION,
    "usage: OvrinMerge merge  [-l|-r|-p|-h] [-i file] [-o file]",
    "                             [--rules rulesfile]",
    "                             [--fallback fallbackspecfile] ",
    "                             [--force] [--describe]",
    "                             <base> <left> <right> [dest]",
    "                             [premerge base dest] [premerge right dest]",
    "       OvrinMerge strip <left> <right>",
    "",
    "       -l         Resolve merge conflicts using left  (theirs)",
    "       -r         Resolve merge conflicts using right (mine)",
    "       -i file    Resolve merge conflicts using merge file",
    "       -o file    File to write merge conflicts into",
    "       -p         Use premerging",
    "       -h         Use 'headless' mode (no error dialogs)",
    "       --rules    A files with merge rules",
    "       --typeInfo A file with type information on objects in asset files",
    "       --fallback Spec file defining fallback tools on conflicts if not using",
    "                  builtin. Can be set to 'none' to disable fallback.",
    "       --force    Force merging even on unknown file extensions",
    "       --describe Include description of what has been done in the -o file.",
    "",
    "  The -l and -r options will first try to use the -i file if provided to",
    "  determine how to resolve and next fallback to either left, right",
    "  or base (default).",
    "  This is useful for using this tool as a first premerge pass before running ",
    "  another merge tool as fallback.",
    "",
    "  For doing a normal premerge use the -p option. This will create a new left ",
    "  (theirs) file that contains all non-conflicting merges and the left side ",
    "  values for where there are conflicts. The same will be done the base file and",
    "  right file and put into a temporary file unless [premerge base dest] / ",
    "  [premerge right dest] is specified in which case that will be used instead.",
    "  As a result the fallback merge tool will not show the original left,right or base",
    "  files but the premerged ones which contains only conflicts that this tool",
    "  could not handle.",
    "",
    "  The fallback tool does not use any of the options. Ovrin ships with a default",
    "  fallback specfile that is used if nothing else is specified. Ovrin also ships",
    "  with a default rules file that is used if nothing else is specified.",
    "  In order to be able to use this tool with subversion any invocation with 1st",
    "  argument not 'merge' is taken as being called from subversion which",
    "  hard codes parameters.",
    "",
    "  There is also an experimental 'diff' command which takes two files and outputs",
    "  the changes between the two files in a custom format. Do not rely on this",
    "  format to be stable as it will likely change.",
};

} // namespace

void usage() {
    for (const char* line : kUsageLines) std::cout << line << std::endl;
}
