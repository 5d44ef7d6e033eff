#include "Describe/FishCompletion.h"

namespace {

std::string InQuotes(const std::string& text) {
    return "'" + Escaped(text, "'\\", "\\&") + "'";
}

/// The start of a line about what may follow the command; empty for what stands in place of one.
std::string Line(const DescribedProgram& program, const std::string& command) {
    return "complete -c " + program.name + " -n '__" + program.name + "_runs " +
           (command.empty() ? "\"\"" : command) + "'";
}

bool AreFiles(const Values& values) {
    return values.more == Values::More::Files || values.more == Values::More::RevisionsAndFiles;
}

bool AreRevisions(const Values& values) {
    return values.more == Values::More::Revisions || values.more == Values::More::RevisionsAndFiles;
}

std::string ValueFlags(const Values& values) {
    std::string flags = AreFiles(values) ? " -F" : " -f";
    if (AreRevisions(values))
        flags += " -a " + InQuotes("(" + std::string(kListRevisions) + ")");
    else if (!values.words.empty())
        flags += " -a " + InQuotes(Joined(values.words, " "));
    return flags;
}

std::string OptionFlags(const DescribedOption& option) {
    std::string flags;
    for (const std::string& word : option.words)
        flags += word.starts_with("--") ? " -l " + word.substr(2) : " -s " + word.substr(1);
    if (!option.value.empty()) flags += " -r" + ValueFlags(option.values);
    return flags + " -d " + InQuotes(option.meaning);
}

/// fish completes the names of files behind a command unless it is told not to.
void WriteOperands(std::ostream& out, const DescribedProgram& program, const DescribedCommand& command) {
    bool areFiles = false;
    for (const Operand& operand : command.operands) {
        areFiles |= AreFiles(operand.values);
        if (!operand.values.words.empty() || AreRevisions(operand.values))
            out << Line(program, command.name) << ValueFlags(operand.values) << '\n';
    }
    if (!areFiles) out << Line(program, command.name) << " -f\n";
}

} // namespace

void WriteFish(std::ostream& out, const DescribedProgram& program) {
    out << "# Completion of " << program.name << " for fish.\nfunction __" << program.name
        << "_runs --argument-names command\n"
        << "    set -l words (commandline -opc)\n    test \"$words[2]\" = \"$command\"\nend\n";
    for (const DescribedCommand& command : program.commands)
        out << Line(program, "") << " -f -a " << command.name << " -d " << InQuotes(command.meaning) << '\n';
    for (const DescribedOption& option : program.options)
        out << Line(program, "") << OptionFlags(option) << '\n';
    for (const DescribedCommand& command : program.commands) {
        WriteOperands(out, program, command);
        for (const DescribedOption& option : command.options)
            out << Line(program, command.name) << OptionFlags(option) << '\n';
    }
}
