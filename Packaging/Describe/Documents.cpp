#include "Describe/Documents.h"

#include <algorithm>

namespace {

/// BASE LEFT RIGHT [DEST [PREMERGED_BASE [PREMERGED_RIGHT]]]
std::string OperandForms(const DescribedCommand& command) {
    std::string text;
    for (const Operand& operand : command.operands) text += (operand.isRequired ? " " : " [") + operand.name;
    const auto optional = std::ranges::count(command.operands, false, &Operand::isRequired);
    return text + std::string(static_cast<std::size_t>(optional), ']');
}

} // namespace

void WriteSynopsis(std::ostream& out, const DescribedProgram& program) {
    for (const DescribedCommand& command : program.commands) {
        out << program.name << ' ' << command.name;
        if (&command == &program.commands.front())
            out << " [options]";
        else
            for (const DescribedOption& option : command.options) out << " [" << Form(option) << ']';
        out << OperandForms(command) << '\n';
    }
}

void WriteOptions(std::ostream& out, const DescribedProgram& program) {
    for (const DescribedOption& option : program.commands.front().options) out << Form(option) << '\n';
}

void WriteReadmeTable(std::ostream& out, const DescribedProgram& program) {
    for (const DescribedOption& option : program.commands.front().options)
        out << "| `" << Form(option) << "` | " << option.meaning << " |\n";
}

void WriteCommands(std::ostream& out, const DescribedProgram& program) {
    for (const DescribedCommand& command : program.commands) out << command.name << '\n';
}

void WriteWords(std::ostream& out, const DescribedProgram& program) {
    for (const DescribedCommand& command : program.commands) {
        for (const DescribedOption& option : command.options)
            for (const std::string& word : option.words) out << command.name << ' ' << word << '\n';
        for (const Operand& operand : command.operands) {
            if (operand.values.words.empty()) out << command.name << ' ' << operand.name << '\n';
            for (const std::string& word : operand.values.words) out << command.name << ' ' << word << '\n';
        }
    }
}
