#pragma once

namespace CLI {
class App;
class Option;
} // namespace CLI

namespace ovrin {

struct DiffOperands;

/// Adds what commands take that compare versions: revisions or files, which `words` explains, paths and the
/// index. Returns the option of the index. The operands must stay.
CLI::Option* AddDiffOperands(CLI::App& command, DiffOperands& operands, const char* words);

} // namespace ovrin
