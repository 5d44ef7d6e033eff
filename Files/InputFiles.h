#pragma once

#include "Diff/MergeRules.h"
#include "Repair/YAMLTypeInfo.h"
#include "Session/InputFile.h"

#include <string>

/// The name of the rules file that stands beside the executable, wherever that is.
inline const std::string kDefaultRulesFile = "auto";
inline const std::string kDefaultTypeInfoFile; // empty: none

/// The object file at `path`. Taking it throws YAMLError for a file that can't be read.
ovrin_yaml::InputFile FileInput(const std::string& path);

/// Reads the rules file of that name, "auto" being the one beside the executable. Throws YAMLError if the
/// file can't be read and std::runtime_error for a bad line.
ovrin_yaml::MergeRules SetupRules(const std::string& rulesFile);

/// Reads the type information of that object file. Throws YAMLError if the file can't be read and
/// std::runtime_error for a bad entry.
ovrin_yaml::YAMLTypeInfoManager SetupTypeInfo(const std::string& typeInfoFile);
