#pragma once

#include <string>
#include <string_view>

namespace ovrin_fuzz {

// The checks of the inputs beside the object files. Each returns what was found to be wrong, or an empty
// text.

/// A rules file. A failure names a line, and that one is the first bad line: without it and what follows the
/// file is accepted, and with it alone behind its section it is not. The rules that were read, written as a
/// rules file, are read as the same.
std::string CheckRules(std::string_view input);

/// A file of decisions. Those that were read, written by a report, are read back the same; each path finds
/// the first decision whose pattern matches it.
std::string CheckResolve(std::string_view input);

/// A type information file; an input that doesn't begin with "%" is the list of types. Read twice it gives
/// the same types, and so does what the writer makes of it. Sets of ids are ascending.
std::string CheckTypeInfo(std::string_view input);

/// A merge spec file. Every entry stands in a line of the file, in its order, and a failure names the first
/// line of an unknown mode.
std::string CheckMergeSpec(std::string_view input);

/// A command line, one argument a line. What is accepted is accepted as well when it is written from the
/// settings, and gives the same settings.
std::string CheckCommandLine(std::string_view input);

} // namespace ovrin_fuzz
