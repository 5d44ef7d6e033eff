#pragma once

#include "Fallback.h"
#include "InputFiles.h"

#include "Merge/MergeResolve.h"

#include <string>

/// The settings of a command over two files.
struct TwoFileConfig {
    std::string leftFile;  // theirs
    std::string rightFile; // mine
    std::string destFile;  // empty: standard output
    std::string rulesFile = kDefaultRulesFile;
    std::string typeInfoFile = kDefaultTypeInfoFile; // empty: none
    bool timing = false;                             // print how long each stage took
    bool useThreads = true;                          // read and diff on threads
    bool headless = false; // nothing depends on it: there are no dialogs to suppress
};

struct DiffConfig : TwoFileConfig {};
struct StripConfig : TwoFileConfig {};

/// The settings of one merge.
struct MergeConfig : TwoFileConfig {
    std::string baseFile; // common ancestor
    std::string premergeBaseDest;
    std::string premergeRightDest;
    ovrin_yaml::MergeResolve resolve = ovrin_yaml::ResolveBase; // what an open conflict falls back to
    std::string resolveFile;                                    // empty: none
    std::string conflictFile;                                   // empty: standard output
    std::string fallbackSpecFile = kDefaultSpecFile;            // "none": no external tool
    bool premerge = false;
    bool force = false;    // merge whatever the extension
    bool describe = false; // the conflict report also tells what was done
};
