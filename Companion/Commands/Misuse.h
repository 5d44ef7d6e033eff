#pragma once

#include <string>
#include <vector>

namespace CLI {
class App;
class ParseError;
} // namespace CLI

namespace ovrin {

/// Why `program` refused the arguments with `error`, and what to do: lines for standard error.
std::string DescribeMisuse(const CLI::App& program, const CLI::ParseError& error,
                           const std::vector<std::string>& arguments);

} // namespace ovrin
