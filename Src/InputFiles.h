#pragma once

#include "Document/OvrinObjects.h"

#include <string>

/// Reads an object file into `objects`, which must be empty. Throws YAMLError with the path and the fault.
void ReadYAMLPath(const std::string& path, ovrin_yaml::OvrinObjects& objects);

/// Loads the rules file of that name, "auto" being the one beside the executable. Called once per command,
/// before any file is read. Throws YAMLError if the file can't be read and std::runtime_error for a bad line.
void SetupRules(const std::string& rulesFile);

/// Loads the type information of that object file into the library. Called at most once per command, before
/// threads are started. Throws YAMLError if the file can't be read and std::runtime_error for a bad entry.
void SetupTypeInfo(const std::string& typeInfoFile);
