#pragma once

#include <cstddef>
#include <string>

/// The value of HOME, or "~" where it is not set.
std::string GetUserHomeDir();

/// A path of the program in the form of the platform, which is the same here.
std::string OvrinToNativePath(const std::string& path);

/// The path of every temporary file: six characters stand for each X.
inline constexpr const char* kTempFileTemplate = "/tmp/MERGEXXXXXX";

/// Makes an empty file in the temporary directory, which nothing removes. Empty on failure.
std::string CreateTempFile();

/// Whether the file is there and this user may read it.
bool FileExists(const char* path);

/// False for a file of which that can't be told.
bool IsMissing(const std::string& path);

/// False for a file of which that can't be told.
bool IsFileEmpty(const std::string& path);

/// What stands behind the last dot of the whole path; directories count as part of the name.
std::string GetFileExtension(const std::string& path);

/// The folder of a path, with its separator at the end.
std::string GetFolder(const std::string& path);

/// The directory of the executable, which holds the data files, with its separator at the end. Empty, and
/// reported, where it can't be found.
std::string GetDataFilesDir();

/// Bytes in a file; 0 if that can't be told beforehand.
std::size_t FileSize(const std::string& path);

enum class ReadResult { Complete, CannotOpen, CannotRead };

/// Reads a file into `bytes` up to its end, which need not be known beforehand: pipes are read as well. A
/// directory can be opened and not be read. On failure `bytes` is unspecified.
ReadResult ReadWholeFile(const std::string& path, std::string& bytes);
