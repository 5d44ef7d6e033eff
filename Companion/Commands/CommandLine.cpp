#include "Commands/CommandLine.h"

#include "Commands/CommandTable.h"
#include "Commands/Help.h"
#include "Commands/Misuse.h"
#include "Commands/Output.h"
#include "Commands/PathArguments.h"
#include "Names/PrintableText.h"
#include "Words/Failure.h"

#include "Descriptor.h"
#include "Values/YAMLError.h"
#include "Values/YAMLScalar.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <new>
#include <sstream>

namespace ovrin {

namespace {

constexpr const char* kDescription =
    "Merges, checks and compares scenes by their objects, with version control.";

struct Described {
    CLI::App* app;
    Action action;
};

Described Describe(CLI::App& program, const Command& command) {
    CLI::App* app = program.add_subcommand(command.name, command.summary)->group("Commands");
    return {app, command.describe(*app)};
}

/// The version control systems call this program for every file: where the command is named first, as they
/// do, the others needn't be described.
std::vector<Described> DescribeWanted(CLI::App& program, const std::vector<std::string>& arguments) {
    FormatHelp(program);
    program.set_version_flag("--version", "ovrin " OVRIN_VERSION, "print the version");
    program.require_subcommand(1);
    const auto commands = Commands();
    const auto named = std::ranges::find_if(
        commands, [&](const Command& command) { return !arguments.empty() && arguments[0] == command.name; });
    std::vector<Described> described;
    if (named != commands.end())
        described.push_back(Describe(program, *named));
    else
        for (const Command& command : commands) described.push_back(Describe(program, command));
    return described;
}

/// Names of files and branches, and what other programs said, may stand in it.
void TellFailure(const std::string& what) {
    Tell("ovrin: " + PrintableLines(what) + '\n');
}

Outcome RunAction(const Action& action) {
    try {
        return action();
    } catch (const std::bad_alloc&) {
        Tell("ovrin: out of memory\n");
    } catch (const std::exception& error) {
        TellFailure(error.what());
    } catch (const ovrin_yaml::YAMLError& error) {
        TellFailure(error.what());
    }
    return Outcome::Failed;
}

/// What --help and --version ask for.
Outcome PrintAnswer(const CLI::App& program, const CLI::ParseError& question) {
    std::ostringstream answer;
    program.exit(question, answer, answer);
    PrintResult(answer.str());
    return Outcome::Done;
}

Outcome TellMisuse(const CLI::App& program, const CLI::ParseError& error,
                   const std::vector<std::string>& arguments) {
    if (error.get_exit_code() == static_cast<int>(CLI::ExitCodes::Success))
        return RunAction([&] { return PrintAnswer(program, error); });
    Tell(PrintableLines(DescribeMisuse(program, error, arguments)));
    return Outcome::Failed;
}

} // namespace

Outcome RunCommandLine(const std::vector<std::string>& arguments) {
    OutliveFailedWrites();
    ovrin_yaml::initialize();
    CLI::App program(kDescription, "ovrin");
    const std::vector<Described> commands = DescribeWanted(program, arguments);
    try {
        const std::vector<std::string> words = WithPathOptions(program, arguments);
        program.parse(std::vector<std::string>(words.rbegin(), words.rend()));
    } catch (const CLI::ParseError& error) {
        return TellMisuse(program, error, arguments);
    }
    const auto named =
        std::ranges::find_if(commands, [](const Described& command) { return command.app->parsed(); });
    return RunAction(named->action);
}

void DescribeAll(CLI::App& app) {
    DescribeWanted(app, {});
}

} // namespace ovrin
