#pragma once

#include <string>
#include <string_view>
#include <vector>

/// What a fuzz target defines: the check of one input. Returns what was found to be wrong, or an empty text.
std::string CheckInput(std::string_view input);

/// Of a target whose inputs are object files: the files of an input, and the input of files.
std::vector<std::string> FilesOfInput(std::string_view input);
std::string InputOfFiles(const std::vector<std::string>& files);
