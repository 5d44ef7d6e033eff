#include "CommandLine.h"

#include "Descriptor.h"
#include "DiffCommand.h"
#include "ErrMsg.h"
#include "MergeCommand.h"
#include "SelfCheck.h"
#include "StripCommand.h"
#include "Usage.h"
#include "Values/YAMLScalar.h"

#include <functional>
#include <sstream>
#include <string_view>

using namespace ovrin_yaml;

bool gHeadlessEnabled = false;

namespace {

std::stringstream errs;

constexpr std::string_view kCmdStrip = "strip";
constexpr std::string_view kCmdDiff = "diff";
constexpr std::string_view kCmdMerge = "merge";
constexpr std::string_view kCmdUnittest = "unittest";

constexpr std::string_view kOptionUseLeft = "-l";
constexpr std::string_view kOptionUseRight = "-r";
constexpr std::string_view kOptionUsePremerge = "-p";
constexpr std::string_view kOptionUseMergeFile = "-i";
constexpr std::string_view kOptionUseConflictFile = "-o";
constexpr std::string_view kOptionRules = "--rules";
constexpr std::string_view kOptionTypeInfo = "--typeInfo";
constexpr std::string_view kOptionFallback = "--fallback";
constexpr std::string_view kOptionDescribe = "--describe";
constexpr std::string_view kOptionForce = "--force";
constexpr std::string_view kOptionTiming = "--timing";
constexpr std::string_view kOptionNoThreads = "--nothreads";
constexpr std::string_view kOptionHeadless = "-h";

/// An option that stands alone. `take` returns false where it is refused, with the error reported.
struct FlagOption {
    std::string_view word;
    std::function<bool()> take;
};

/// An option whose value is the next argument, whatever that looks like.
struct ValueOption {
    std::string_view word;
    std::string* target;
};

/// What a command takes: options in any order, then paths, of which some must be there.
struct Grammar {
    std::string_view command;
    std::vector<FlagOption> flags;
    std::vector<ValueOption> values;
    std::vector<std::string*> paths;
    std::size_t requiredPaths;
};

FlagOption Sets(std::string_view word, bool& target, bool value = true) {
    return {word, [&target, value] {
                target = value;
                return true;
            }};
}

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

bool RefusePathCount(const Grammar& grammar, std::size_t count) {
    return Refuse("Error: " + std::string(grammar.command) + " command takes exactly " +
                  std::to_string(grammar.requiredPaths) + " paths but " + std::to_string(count) +
                  " was provided.");
}

template <class Option> const Option* Find(const std::vector<Option>& options, const std::string& word) {
    for (const Option& option : options)
        if (option.word == word) return &option;
    return nullptr;
}

void TakePaths(std::vector<std::string>& args, std::size_t first, const Grammar& grammar) {
    for (std::size_t i = 0; i < grammar.paths.size() && first + i < args.size(); ++i)
        *grammar.paths[i] = std::move(args[first + i]);
}

bool Parse(std::vector<std::string>& args, std::size_t position, const Grammar& grammar) {
    for (; position < args.size(); ++position) {
        if (const FlagOption* flag = Find(grammar.flags, args[position])) {
            if (!flag->take()) return false;
            continue;
        }
        const std::size_t remaining = args.size() - position;
        if (remaining < 2) return RefusePathCount(grammar, 1);
        if (const ValueOption* option = Find(grammar.values, args[position])) {
            *option->target = std::move(args[++position]);
            continue;
        }
        if (remaining < grammar.requiredPaths) return RefusePathCount(grammar, remaining);
        TakePaths(args, position, grammar);
        return true;
    }
    return RefusePathCount(grammar, 0);
}

FlagOption SetsResolve(std::string_view word, MergeConfig& config, MergeResolve resolve) {
    return {word, [word, &config, resolve] {
                if (config.resolve != ResolveBase)
                    return Refuse("Error: Only one of then -l, -r and -p may be provided");
                config.resolve = resolve;
                config.premerge = word == kOptionUsePremerge;
                return true;
            }};
}

bool ParseTwoFileArgs(CommandLineArguments& arguments, int first, std::string_view command,
                      TwoFileConfig& config) {
    const Grammar grammar{command,
                          {Sets(kOptionTiming, config.timing),
                           Sets(kOptionNoThreads, config.useThreads, false),
                           Sets(kOptionHeadless, gHeadlessEnabled)},
                          {{kOptionRules, &config.rulesFile}, {kOptionTypeInfo, &config.typeInfoFile}},
                          {&config.leftFile, &config.rightFile, &config.destFile},
                          2};
    return Parse(arguments.args, first, grammar);
}

ExitStatus RunDiff(CommandLineArguments& arguments) {
    DiffConfig config;
    if (!ParseDiffArgs(arguments, 2, config)) return ExitStatus::Failed;
    return HandleDiffCommand(config);
}

ExitStatus RunStrip(CommandLineArguments& arguments) {
    StripConfig config;
    if (!ParseStripArgs(arguments, 2, config)) return ExitStatus::Failed;
    return HandleStripCommand(config);
}

ExitStatus RunMerge(CommandLineArguments& arguments) {
    MergeConfig config;
    if (!ParseMergeArgs(arguments, 2, config)) return ExitStatus::Failed;
    return ProcessMergeCommand(config);
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

} // namespace

bool ParseMergeArgs(CommandLineArguments& arguments, int first, MergeConfig& config) {
    config.resolve = ResolveBase;
    config.premerge = false;
    const Grammar grammar{
        kCmdMerge,
        {SetsResolve(kOptionUseLeft, config, ResolveLeft), SetsResolve(kOptionUseRight, config, ResolveRight),
         SetsResolve(kOptionUsePremerge, config, ResolveLeft), Sets(kOptionForce, config.force),
         Sets(kOptionDescribe, config.describe), Sets(kOptionTiming, config.timing),
         Sets(kOptionNoThreads, config.useThreads, false), Sets(kOptionHeadless, gHeadlessEnabled)},
        {{kOptionUseMergeFile, &config.resolveFile},
         {kOptionUseConflictFile, &config.conflictFile},
         {kOptionRules, &config.rulesFile},
         {kOptionTypeInfo, &config.typeInfoFile},
         {kOptionFallback, &config.fallbackSpecFile}},
        {&config.baseFile, &config.leftFile, &config.rightFile, &config.destFile, &config.premergeBaseDest,
         &config.premergeRightDest},
        3};
    return Parse(arguments.args, first, grammar);
}

bool ParseDiffArgs(CommandLineArguments& arguments, int first, DiffConfig& config) {
    return ParseTwoFileArgs(arguments, first, kCmdDiff, config);
}

bool ParseStripArgs(CommandLineArguments& arguments, int first, StripConfig& config) {
    return ParseTwoFileArgs(arguments, first, kCmdStrip, config);
}

ExitStatus InnerMain(CommandLineArguments& arguments) {
    initialize();
    OutliveFailedWrites();
    std::vector<std::string>& args = arguments.args;
    if (args.size() < 2) {
        Refuse("Error: need 'merge' command specified");
        return ExitStatus::Failed;
    }
    const std::string& command = args[1];
    if (command == kCmdStrip) return RunStrip(arguments);
    if (command == kCmdDiff) return RunDiff(arguments);
    if (command == kCmdMerge) return RunMerge(arguments);
    if (command == kCmdUnittest) return RunUnitttests();
    if (command.starts_with('-')) {
        Report("Missing command (e.g. 'merge') before option " + command);
        return ExitStatus::Failed;
    }
    if (args.size() != 6) {
        Refuse("Error: unknown command " + command);
        return ExitStatus::Failed;
    }
    return RunVersionControlForm(args);
}
