#include "CommandLine.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <ranges>
#include <regex>
#include <set>
#include <sstream>

using namespace ovrin_yaml;

namespace {

/// "merge -l a" as the process gets it; '' stands for an empty argument.
CommandLineArguments Arguments(const std::string& line) {
    std::vector<std::string> words{"OvrinMerge"};
    std::istringstream stream(line);
    for (std::string word; stream >> word;) words.push_back(word == "''" ? "" : word);
    std::vector<const char*> pointers;
    for (const std::string& word : words) pointers.push_back(word.c_str());
    return CommandLineArguments(static_cast<int>(pointers.size()), pointers.data());
}

struct Outcome {
    ExitStatus status;
    std::string errors; // ends in the last message; messages before it may be repeated in front
    std::string output;
};

Outcome RunMain(const std::string& line) {
    CommandLineArguments arguments = Arguments(line);
    testing::internal::CaptureStderr();
    testing::internal::CaptureStdout();
    const ExitStatus status = InnerMain(arguments);
    return {status, testing::internal::GetCapturedStderr(), testing::internal::GetCapturedStdout()};
}

MergeConfig Settings(const std::string& command, const std::string& line) {
    CommandLineArguments arguments = Arguments(command + " " + line);
    MergeConfig config;
    EXPECT_TRUE(ParseArguments(*FindCommand(command), arguments, config)) << line;
    return config;
}

MergeConfig Merge(const std::string& line) {
    return Settings("merge", line);
}

TwoFileConfig Diff(const std::string& line) {
    return Settings("diff", line);
}

std::string Paths(const MergeConfig& config) {
    return config.baseFile + "," + config.leftFile + "," + config.rightFile + "," + config.destFile + "," +
           config.premergeBaseDest + "," + config.premergeRightDest;
}

std::string Paths(const TwoFileConfig& config) {
    return config.leftFile + "," + config.rightFile + "," + config.destFile;
}

TEST(CommandLine, WrongArgumentsAreExplained) {
    const std::string paths = " was provided.", merge = "Error: merge command takes exactly 3 paths but ";
    const std::string onlyOne = "Error: Only one of then -l, -r and -p may be provided";
    const struct {
        const char* line;
        std::string message;
        bool usage = true;
    } cases[] = {
        {"", "Error: need 'merge' command specified"},
        {"-x", "Missing command (e.g. 'merge') before option -x", false},
        {"-x b c d e", "Missing command (e.g. 'merge') before option -x", false},
        {"Merge a b c", "Error: unknown command Merge"},
        {"'' b", "Error: unknown command "},
        {"merge", merge + "0" + paths},
        {"merge --force", merge + "0" + paths},
        {"merge --rules x", merge + "0" + paths},
        {"merge a", merge + "1" + paths},
        {"merge -i", merge + "1" + paths},
        {"merge a b", merge + "2" + paths},
        {"merge -l -l a b c", onlyOne},
        {"merge -r -p a b c", onlyOne},
        {"diff", "Error: diff command takes exactly 2 paths but 0" + paths},
        {"diff --typeInfo", "Error: diff command takes exactly 2 paths but 1" + paths},
        {"strip --timing a", "Error: strip command takes exactly 2 paths but 1" + paths},
    };
    for (const auto& [line, message, usage] : cases) {
        const Outcome outcome = RunMain(line);
        EXPECT_EQ(outcome.status, ExitStatus::Failed) << line;
        EXPECT_TRUE(outcome.errors.ends_with(message + "\n")) << line << "\n" << outcome.errors;
        EXPECT_EQ(!outcome.output.empty(), usage) << line;
    }
}

TEST(CommandLine, AnErrorBringsBackTheEarlierOnes) {
    const std::string first = RunMain("").errors;
    EXPECT_EQ(RunMain("merge").errors,
              first + "Error: merge command takes exactly 3 paths but 0 was provided.\n");
}

TEST(CommandLine, UsageKeepsItsBlanksAndEmptyLines) {
    const std::string text = RunMain("").output;
    EXPECT_TRUE(text.starts_with("Ovrin YAML Merge Tool for scene or prefab files - version 1.0.1\n"
                                 "usage: OvrinMerge merge  [-l|-r|-p|-h] [-i file] [-o file]\n"));
    EXPECT_NE(text.find("[--fallback fallbackspecfile] \n"), std::string::npos);
    EXPECT_TRUE(text.ends_with("  format to be stable as it will likely change.\n"));
    EXPECT_EQ(std::count(text.begin(), text.end(), '\n'), 47);
}

/// The words of the text that the pattern finds.
std::set<std::string> Found(const std::string& text, const char* pattern) {
    const std::regex words(pattern);
    std::set<std::string> found;
    for (std::sregex_iterator i(text.begin(), text.end(), words); i != std::sregex_iterator(); ++i)
        found.insert(i->str(1));
    return found;
}

TEST(CommandLine, UsageNamesWhatTheTableSaysItNames) {
    const std::string text = RunMain("").output;
    std::set<std::string> commands, options;
    for (const Command& command : kCommands) {
        if (command.isInUsage) commands.emplace(command.word);
        for (const Option& option : command.options | std::views::join)
            if (option.isInUsage) options.emplace(option.word);
    }
    EXPECT_EQ(Found(text, "[ |\\[](--?[a-zA-Z]+)"), options);
    EXPECT_EQ(Found(text, "(?:OvrinMerge |experimental ')([a-z]+)"), commands);
}

TEST(CommandLine, OptionsEndAtTheFirstPath) {
    EXPECT_EQ(Paths(Merge("a b c")), "a,b,c,,,");
    EXPECT_EQ(Paths(Merge("a b c --force")), "a,b,c,--force,,");
    EXPECT_EQ(Paths(Merge("--force a b c d e f g")), "a,b,c,d,e,f");
    EXPECT_EQ(Paths(Diff("-l a")), "-l,a,");
    EXPECT_EQ(Paths(Diff("--nothreads a b c d")), "a,b,c");
}

TEST(CommandLine, OptionsTakeAnyNextWordAsTheirValue) {
    const MergeConfig config = Merge("-i -o -o report --rules -l --typeInfo t --fallback none a b c");
    EXPECT_EQ(config.resolveFile, "-o");
    EXPECT_EQ(config.conflictFile, "report");
    EXPECT_EQ(config.rulesFile, "-l");
    EXPECT_EQ(config.typeInfoFile, "t");
    EXPECT_EQ(config.fallbackSpecFile, "none");
    EXPECT_EQ(config.resolve, ResolveBase);
}

TEST(CommandLine, EachFlagSetsItsField) {
    const MergeConfig none = Merge("a b c");
    EXPECT_FALSE(none.force || none.describe || none.timing || none.premerge || !none.useThreads);
    const MergeConfig all = Merge("--force --describe --timing --nothreads -h a b c");
    EXPECT_TRUE(all.force && all.describe && all.timing && !all.useThreads && all.headless);
    EXPECT_EQ(Merge("-l a b c").resolve, ResolveLeft);
    EXPECT_EQ(Merge("-r a b c").resolve, ResolveRight);
    EXPECT_EQ(Merge("-p a b c").resolve, ResolveLeft);
    EXPECT_TRUE(Merge("-p a b c").premerge);
    EXPECT_FALSE(Merge("-l a b c").premerge);
    EXPECT_TRUE(Diff("--timing a b").timing);
}

} // namespace
