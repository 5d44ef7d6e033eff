#include "Commands/CommandLine.h"
#include "Commands/Argument.h"
#include "Commands/Help.h"
#include "Commands/Misuse.h"
#include "Commands/Suggestion.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

TEST(CommandLine, NearestWordIsTheOneMeant) {
    const std::vector<std::string> known = {"--json", "--sarif", "--all", "--staged"};
    EXPECT_EQ(Nearest("--jsn", known), "--json");
    EXPECT_EQ(Nearest("--jsno", known), "--json");
    EXPECT_EQ(Nearest("--staging", known), "--staged");
    EXPECT_EQ(Nearest("--verbose", known), "");
}

TEST(CommandLine, MisuseFails) {
    EXPECT_EQ(RunCommandLine({"nothing-known"}), Outcome::Failed);
    EXPECT_EQ(RunCommandLine({}), Outcome::Failed);
}

/// A program with one command that has an option of each kind.
struct Sample {
    CLI::App program{"Samples.", "ovrin"};
    CLI::Option *format, *jobs, *set;
    std::string text;
    int number = 0;
    std::vector<std::string> several;

    Sample() {
        FormatHelp(program);
        program.require_subcommand(1);
        CLI::App* check = program.add_subcommand("check", "Looks.");
        format = check->add_option("--format", text, "how")->check(CLI::IsMember({"json", "sarif"}));
        jobs = check->add_option("-j,--jobs", number, "how many");
        set = check->add_option("--set", several, "decisions")->option_text("PATH=SIDE");
        check->add_option("FILE", text, "a scene")->required();
    }

    /// The first line that a misuse is told with, and what is suggested.
    std::string Misuse(const std::vector<std::string>& arguments) {
        try {
            program.parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));
        } catch (const CLI::ParseError& error) {
            const std::string told = DescribeMisuse(program, error, arguments);
            return told.substr(0, told.find("\n\"ovrin"));
        }
        return "";
    }
};

TEST(CommandLine, AMisuseIsToldInPlainWords) {
    Sample sample;
    EXPECT_EQ(sample.Misuse({"chek"}), "ovrin: there is no command \"chek\".\nDid you mean check?");
    EXPECT_EQ(sample.Misuse({"check", "a", "--jbos"}),
              "ovrin check: there is no option \"--jbos\".\nDid you mean --jobs?");
    EXPECT_EQ(sample.Misuse({"check", "a", "--", "-b"}), "ovrin check: \"-b\" is an argument too many.");
    EXPECT_EQ(sample.Misuse({"check", "a", "b", "c"}), "ovrin check: \"b\" and more are arguments too many.");
    EXPECT_EQ(sample.Misuse({"check"}), "ovrin check: FILE is required.");
    EXPECT_EQ(sample.Misuse({"check", "a", "--jobs"}), "ovrin check: --jobs needs a value.");
    EXPECT_EQ(sample.Misuse({"check", "a", "-jx"}), "ovrin check: --jobs can't be \"x\".");
    EXPECT_EQ(sample.Misuse({"check", "a", "-j1", "-j2"}), "ovrin check: --jobs is given too often.");
    EXPECT_EQ(sample.Misuse({"check", "a", "--format", "xml"}),
              "ovrin check: --format can't be \"xml\", only json, sarif.");
    EXPECT_EQ(Sample().Misuse({}).substr(0, 42), "ovrin: a command is missing.\nSamples.\n\nUsa");
}

TEST(CommandLine, ValuesAreToldByTheirWords) {
    const Sample sample;
    EXPECT_EQ(ValueForm(*sample.format), "json|sarif");
    EXPECT_EQ(ValueForm(*sample.jobs), "N");
    EXPECT_EQ(ValueForm(*sample.set), "PATH=SIDE");
    EXPECT_TRUE(IsRepeated(*sample.set));
    EXPECT_TRUE(AllowedWords(*sample.jobs).empty());
}

} // namespace
