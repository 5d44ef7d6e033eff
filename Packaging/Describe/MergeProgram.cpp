#include "Describe/MergeProgram.h"

#include "CommandTable.h"

namespace {

DescribedOption Describe(const Option& option) {
    DescribedOption described{
        {std::string(option.word)}, std::string(option.value), std::string(option.meaning), false, {}};
    if (!option.value.empty()) described.values.more = Values::More::Files;
    if (!option.notAFile.empty()) described.values.words.emplace_back(option.notAFile);
    return described;
}

DescribedCommand Describe(const Command& command) {
    DescribedCommand described{std::string(command.word), std::string(command.meaning), {}, {}};
    for (const auto& group : command.options)
        for (const Option& option : group) described.options.push_back(Describe(option));
    for (const PathArgument& path : command.paths)
        described.operands.push_back({std::string(path.name),
                                      described.operands.size() < command.requiredPaths,
                                      false,
                                      {{}, Values::More::Files}});
    return described;
}

} // namespace

DescribedProgram DescribeMerge() {
    DescribedProgram program{"OvrinMerge", {}, {}, true};
    for (const Command& command : kCommands) program.commands.push_back(Describe(command));
    return program;
}
