#include "Describe/CompanionProgram.h"

#include "Commands/Argument.h"
#include "Commands/CommandLine.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>

namespace {

std::string FirstLine(const std::string& text) {
    return text.substr(0, text.find('\n'));
}

template <std::size_t N> bool IsOneOf(const std::array<const char*, N>& names, const std::string& name) {
    return std::ranges::find(names, name) != names.end();
}

Values ValuesOf(const CLI::Option& option, const std::string& name) {
    constexpr std::array kRevisions = {"REV", "REVISION", "BRANCH", "COMMIT"};
    constexpr std::array kFiles = {"FILE", "TEXT"};
    Values values{ovrin::AllowedWords(option)};
    if (!values.words.empty()) return values;
    if (IsOneOf(kRevisions, name))
        values.more =
            option.get_expected_max() > 1 ? Values::More::RevisionsAndFiles : Values::More::Revisions;
    else if (option.get_positional() || IsOneOf(kFiles, name))
        values.more = Values::More::Files;
    return values;
}

DescribedOption Describe(const CLI::Option& option) {
    DescribedOption described;
    for (const std::string& name : option.get_lnames()) described.words.push_back("--" + name);
    for (const std::string& name : option.get_snames()) described.words.push_back("-" + name);
    described.value = ovrin::ValueForm(option);
    described.meaning = FirstLine(option.get_description());
    described.isRepeated = ovrin::IsRepeated(option);
    if (!described.value.empty()) described.values = ValuesOf(option, described.value);
    return described;
}

std::vector<DescribedOption> OptionsOf(const CLI::App& app) {
    std::vector<DescribedOption> options;
    for (const CLI::Option* option : app.get_options())
        if (option->nonpositional() && !option->get_group().empty()) options.push_back(Describe(*option));
    for (const CLI::App* group :
         app.get_subcommands([](const CLI::App* sub) { return sub->get_name().empty(); }))
        for (const DescribedOption& option : OptionsOf(*group)) options.push_back(option);
    return options;
}

std::vector<Operand> OperandsOf(const CLI::App& app) {
    std::vector<Operand> operands;
    for (const CLI::Option* option : app.get_options()) {
        if (!option->get_positional()) continue;
        const std::string name = option->get_name(true);
        operands.push_back(
            {name, option->get_required(), ovrin::IsRepeated(*option), ValuesOf(*option, name)});
    }
    return operands;
}

} // namespace

DescribedProgram DescribeCompanion() {
    CLI::App app;
    ovrin::DescribeAll(app);
    DescribedProgram program{"ovrin", OptionsOf(app), {}, false};
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; }))
        program.commands.push_back({command->get_name(), FirstLine(command->get_description()),
                                    OptionsOf(*command), OperandsOf(*command)});
    return program;
}
