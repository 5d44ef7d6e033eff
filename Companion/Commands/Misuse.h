#pragma once

#include <string>

namespace CLI {
class App;
class ParseError;
} // namespace CLI

namespace ovrin {

/// Why `program` refused its arguments with `error`, and what to do: lines for standard error.
std::string DescribeMisuse(const CLI::App& program, const CLI::ParseError& error);

} // namespace ovrin
