#pragma once

#include <string>
#include <string_view>

namespace ovrin_fuzz {

/// The header lines of an object file.
extern const char* const kFileHeader;

/// What is to be read for an input: one that begins with "%" is a whole file, any other the body of an
/// object.
std::string FileOfInput(std::string_view input);

/// Reads a file with the reader for the written form, with the library alone, and recognised, its objects
/// built last. All must give the same trees or the same failure, what is written of them must be the same to
/// the byte, and what was noted of an object for the repair stages must be true. Returns the first
/// difference, or an empty text.
std::string CheckReader(std::string_view file);

} // namespace ovrin_fuzz
