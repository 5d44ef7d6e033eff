#pragma once

#include "ExitStatus.h"

#include <map>
#include <string>
#include <vector>

/// Names of spec files: that which the program finds by itself, and no external tool at all.
inline const std::string kDefaultSpecFile = "auto";
inline const std::string kNoSpecFile = "none";

/// External merge tools: which one serves a file, and its call. A merge spec file lists them, one a line:
///
///     # a comment
///     prefab use "/usr/bin/kdiff3" --base "%b" "%l" "%r" -o "%d"
///     *      use "%programs%/Tool" "%l" "%r" "%d"
///
/// These are an extension, "*" for any; a mode; the tool's path between double quotes; and the tool's
/// arguments, up to the end of the line. "%programs%" in the path stands for two places, so that its line
/// makes two entries. In the arguments "%b", "%l", "%r" and "%d" stand for the paths of base, left, right and
/// destination, which are put in without quotes.
struct FallbackCommandEntry {
    std::string path;
    std::string arguments;
    /// 0 for "use", 1 for "use-on-conflict", 2 for "use-second-pass"; the tools of all modes are equals.
    int mode = 0;
};

/// The entries of each extension, in the order of their lines; the first whose tool exists serves.
using FallbackCommandMap = std::map<std::string, std::vector<FallbackCommandEntry>>;

/// The spec file of that name, "auto" being the one in the home directory or else the one beside the
/// executable. Whether it exists is not checked.
std::string GetSpecFilename(const std::string& name);

/// Reads a spec file. Reports a file that can't be read and the first line of an unknown mode; the lines
/// above it stay valid. Without a message empty for an empty name.
FallbackCommandMap PopulateFallbacks(const std::string& fileName);

/// The first entry for the extension of `fileName`, or else for any, whose tool is a file that this user can
/// read. With an empty path, and reported, if there is none. `specFile` serves the report.
FallbackCommandEntry GetFallbackCommandEntry(const FallbackCommandMap& fallbacks, const std::string& fileName,
                                             const std::string& specFile);

/// `arguments` with the paths in place of the placeholders.
std::string SubstituteMergePlaceholderFilePaths(const std::string& arguments, const std::string& base,
                                                const std::string& left, const std::string& right,
                                                const std::string& dest);

/// Has a tool merge the files into `dest`, and waits for its end. The tool is chosen by the extension of
/// `left` from the spec file of the name `specFile`, "none" being no file. Returns Done on success, Failed
/// if there is no tool, and the raw status of the shell call otherwise, which is -1 if there was none.
ExitStatus FallbackMergeTool(const std::string& base, const std::string& left, const std::string& right,
                             const std::string& dest, const std::string& specFile);
