#include "CommandLine.h"

#include "Descriptor.h"
#include "ErrMsg.h"
#include "MergeCommand.h"
#include "Usage.h"
#include "Values/YAMLScalar.h"

#include <sstream>
#include <string_view>

using namespace ovrin_yaml;

namespace {

constexpr std::size_t kFirstArgument = 2; // behind the names of program and command

std::stringstream errs;

void Report(const std::string& message) {
    errs << message << '\n';
    ErrMsg(errs);
}

/// Always false: the arguments can't be used.
bool Refuse(const std::string& message) {
    Report(message);
    usage();
    return false;
}

bool RefusePathCount(const Command& command, std::size_t count) {
    return Refuse("Error: " + std::string(command.word) + " command takes exactly " +
                  std::to_string(command.requiredPaths) + " paths but " + std::to_string(count) +
                  " was provided.");
}

void TakePaths(std::vector<std::string>& args, std::size_t first, const Command& command,
               MergeConfig& settings) {
    for (std::size_t i = 0; i < command.paths.size() && first + i < args.size(); ++i)
        settings.*command.paths[i].target = std::move(args[first + i]);
}

/// How many arguments there must be from an option on, or from the first path on.
std::size_t NeededFrom(const Option* option, const Command& command) {
    if (!option) return command.requiredPaths;
    return option->value.empty() ? 1 : 2;
}

/// The form of version control systems that have their parameters built in: base, left, right, destination
/// and a fifth argument that means nothing here.
ExitStatus RunVersionControlForm(std::vector<std::string>& args) {
    MergeConfig config;
    config.baseFile = std::move(args[1]);
    config.leftFile = std::move(args[2]);
    config.rightFile = std::move(args[3]);
    config.destFile = std::move(args[4]);
    config.resolve = ResolveLeft;
    config.force = true;
    return ProcessMergeCommand(config);
}

/// The first argument is none of the commands.
ExitStatus RunWithoutCommand(std::vector<std::string>& args) {
    if (args[1].starts_with('-'))
        Report("Missing command (e.g. 'merge') before option " + args[1]);
    else if (args.size() != 6)
        Refuse("Error: unknown command " + args[1]);
    else
        return RunVersionControlForm(args);
    return ExitStatus::Failed;
}

} // namespace

bool ParseArguments(const Command& command, CommandLineArguments& arguments, MergeConfig& settings) {
    if (command.paths.empty()) return true;
    std::vector<std::string>& args = arguments.args;
    for (std::size_t position = kFirstArgument; position < args.size(); ++position) {
        const Option* option = FindOption(command, args[position]);
        const std::size_t remaining = args.size() - position;
        if (remaining < NeededFrom(option, command)) return RefusePathCount(command, remaining);
        if (!option) {
            TakePaths(args, position, command, settings);
            return true;
        }
        if (!option->value.empty()) ++position;
        const std::string_view refusal = option->take(settings, args[position]);
        if (!refusal.empty()) return Refuse(std::string(refusal));
    }
    return RefusePathCount(command, 0);
}

ExitStatus InnerMain(CommandLineArguments& arguments) {
    initialize();
    OutliveFailedWrites();
    std::vector<std::string>& args = arguments.args;
    if (args.size() < 2) {
        Refuse("Error: need 'merge' command specified");
        return ExitStatus::Failed;
    }
    const Command* command = FindCommand(args[1]);
    if (!command) return RunWithoutCommand(args);
    MergeConfig settings;
    return ParseArguments(*command, arguments, settings) ? command->run(settings) : ExitStatus::Failed;
}
