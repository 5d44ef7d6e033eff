#include "Commands/DiffArguments.h"

#include "Commands/DiffVersions.h"
#include "Commands/PathArguments.h"

#include <CLI/CLI.hpp>

namespace ovrin {

CLI::Option* AddDiffOperands(CLI::App& command, DiffOperands& operands, const char* words) {
    command.add_option("REVISION", operands.words, words)->expected(0, -1);
    command.add_option(kPathOption, operands.paths, "only these files or folders; also behind --")
        ->type_name("PATH")
        ->expected(1)
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
    return command.add_flag("--staged,--cached", operands.isStaged, "compare with what is to be committed");
}

} // namespace ovrin
