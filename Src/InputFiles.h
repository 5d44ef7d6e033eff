#pragma once

#include "Diff/MergeRules.h"
#include "Reading/ObjectFile.h"
#include "Repair/YAMLTypeInfo.h"
#include "Values/YAMLError.h"

#include <exception>
#include <new>
#include <string>

/// Takes a step of reading the file `path`. What it throws is thrown again as YAMLError with the path and the
/// fault, but for std::bad_alloc: no file is at fault.
template <class Step> void WithFileName(const std::string& path, const Step& step) {
    try {
        step();
    } catch (const ovrin_yaml::YAMLError& error) {
        throw ovrin_yaml::YAMLError("Error parsing file '" + path + "': " + error.what());
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception& error) {
        throw ovrin_yaml::YAMLError("Error parsing file '" + path +
                                    "' caught unknown exception: " + error.what());
    }
}

/// The first step of reading an object file. Throws YAMLError for a file that can't be read.
void TakeFile(const std::string& path, ovrin_yaml::ObjectFile& file);

/// Reads an object file into `objects`, which must be empty. Throws YAMLError with the path and the fault.
void ReadYAMLPath(const std::string& path, ovrin_yaml::OvrinObjects& objects);

/// Reads the rules file of that name, "auto" being the one beside the executable. Throws YAMLError if the
/// file can't be read and std::runtime_error for a bad line.
ovrin_yaml::MergeRules SetupRules(const std::string& rulesFile);

/// Reads the type information of that object file. Throws YAMLError if the file can't be read and
/// std::runtime_error for a bad entry.
ovrin_yaml::YAMLTypeInfoManager SetupTypeInfo(const std::string& typeInfoFile);
