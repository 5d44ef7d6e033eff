#pragma once

#include <functional>
#include <iosfwd>
#include <string>

/// Lets `write` fill the file at `path`, which is truncated, or standard output where the path is empty. The
/// state of the stream is not looked at: what can't be written is lost.
void WriteOutput(const std::string& path, const std::function<void(std::ostream&)>& write);

/// Copies the file `source` to `dest`, or to standard output where that is empty. Failures are not looked at.
void OutputResultToDestination(const std::string& source, const std::string& dest);
