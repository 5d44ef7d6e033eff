#include "Describe/ZshCompletion.h"

namespace {

std::string InQuotes(const std::string& text) {
    return "'" + Escaped(text, "'", "'\\&'") + "'";
}

/// What may stand behind the second colon of an argument of _arguments.
std::string Action(const Values& values) {
    const std::string words = Joined(values.words, " ");
    const std::string addRevisions = "compadd -- ${(f)\"$(" + Escaped(kListRevisions, ":", "\\&") + ")\"}";
    switch (values.more) {
    case Values::More::None:
        return words.empty() ? " " : "(" + words + ")";
    case Values::More::Revisions:
        return "{" + addRevisions + "}";
    case Values::More::RevisionsAndFiles:
        return "{" + addRevisions + "; _files}";
    case Values::More::Files:
        return words.empty() ? "_files" : "{compadd " + words + "; _files}";
    }
    return "";
}

/// '(-o --output)'{-o+,--output=}'[meaning]:FILE:_files'
std::string OptionSpec(const DescribedOption& option, bool isPlain) {
    std::vector<std::string> forms;
    for (const std::string& word : option.words)
        forms.push_back(word + (isPlain || option.value.empty() ? "" : word.starts_with("--") ? "=" : "+"));
    std::string behind = "[" + Escaped(option.meaning, "[]:\\", "\\&") + "]";
    if (!option.value.empty())
        behind += ":" + Escaped(option.value, ":", "\\&") + ":" + Action(option.values);
    const std::string names = forms.size() == 1 ? forms.front() : "{" + Joined(forms, ",") + "}";
    const std::string before = option.isRepeated ? "'*'" : "'(" + Joined(option.words, " ") + ")'";
    return before + names + InQuotes(behind);
}

std::string OperandSpec(const Operand& operand, std::size_t number) {
    const std::string position = operand.isRepeated ? "*" : std::to_string(number);
    return InQuotes(position + (operand.isRequired || operand.isRepeated ? ":" : "::") +
                    Escaped(operand.name, ":", "\\&") + ":" + Action(operand.values));
}

void WriteCommand(std::ostream& out, const DescribedProgram& program, const DescribedCommand& command) {
    out << command.name << ")\n    _arguments " << (program.isPlain ? "-A '-*'" : "-s -S");
    for (const DescribedOption& option : command.options)
        out << " \\\n        " << OptionSpec(option, program.isPlain);
    for (std::size_t i = 0; i < command.operands.size(); ++i)
        out << " \\\n        " << OperandSpec(command.operands[i], i + 1);
    out << "\n    ;;\n";
}

void WriteCommandList(std::ostream& out, const DescribedProgram& program) {
    out << "if (( CURRENT == 2 )); then\n    local -a commands=(\n";
    for (const DescribedCommand& command : program.commands)
        out << "        " << InQuotes(command.name + ":" + command.meaning) << '\n';
    out << "    )\n    _describe command commands";
    const std::string options = OptionWords(program.options, false);
    if (!options.empty()) out << " -- || compadd -- " << options;
    out << "\n    return\nfi\n";
}

} // namespace

void WriteZsh(std::ostream& out, const DescribedProgram& program) {
    out << "#compdef " << program.name << "\n# Completion of " << program.name << " for zsh.\n";
    WriteCommandList(out, program);
    out << "shift words\n(( CURRENT-- ))\ncase $words[1] in\n";
    for (const DescribedCommand& command : program.commands)
        if (!command.options.empty() || !command.operands.empty()) WriteCommand(out, program, command);
    out << "esac\n";
}
