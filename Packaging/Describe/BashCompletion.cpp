#include "Describe/BashCompletion.h"

namespace {

/// Readline completes the names of files where nothing else is offered, and more cleverly than the function
/// could: what isn't a file has to be told.
std::string Offer(const Values& values) {
    const std::string noFiles = "compopt +o default +o bashdefault 2>/dev/null";
    const std::string take = "mapfile -t COMPREPLY < <(compgen ";
    const std::string takeRevisions = take + "-W \"$(" + std::string(kListRevisions) + ")\" -- \"$word\")";
    if (values.more == Values::More::RevisionsAndFiles) return takeRevisions;
    if (values.more == Values::More::Revisions) return noFiles + "\n        " + takeRevisions;
    if (values.words.empty()) return noFiles;
    const std::string words = "-W '" + Joined(values.words, " ") + "' -- \"$word\")";
    if (values.more == Values::More::Files)
        return take + "-f " + words + "\n        compopt -o filenames 2>/dev/null";
    return noFiles + "\n        " + take + words;
}

/// In the case statement over the command and the option or the number of the operand.
void WriteOffer(std::ostream& out, const std::string& pattern, const Values& values) {
    const bool areFiles = values.words.empty() && values.more == Values::More::Files;
    out << "    " << pattern << ")" << (areFiles ? "" : "\n        " + Offer(values) + "\n       ")
        << " ;;\n";
}

void WriteCommand(std::ostream& out, const DescribedCommand& command) {
    out << "    " << command.name << ")\n        flags='" << OptionWords(command.options, false)
        << "'\n        values='" << OptionWords(command.options, true) << "'\n        ;;\n";
}

void WriteValues(std::ostream& out, const DescribedCommand& command) {
    for (const DescribedOption& option : command.options)
        for (const std::string& word : option.words)
            if (!option.value.empty()) WriteOffer(out, "'" + command.name + " " + word + "'", option.values);
    std::size_t number = 0;
    for (const Operand& operand : command.operands) {
        const std::string position = operand.isRepeated ? "'*" : std::to_string(++number) + "'";
        WriteOffer(out, "'" + command.name + " " + position, operand.values);
    }
    const bool endless = !command.operands.empty() && command.operands.back().isRepeated;
    if (!endless) WriteOffer(out, "'" + command.name + " '[0-9]*", {});
}

/// $option is the option whose value comes next, $operands counts what is no option up to $word.
constexpr const char* kWalk = R"(    esac
    for ((i = 2; i < COMP_CWORD; ++i)); do
        argument=${COMP_WORDS[i]}
        if [ -n "$option" ]; then
            [ "$argument" = '=' ] || option=
        elif [ -n "$ended" ] || [[ $argument != -?* ]]; then
            ((++operands))
            ended=$ended$endsHere
        elif [ "$argument" = -- ]; then
            ended=yes
        elif [[ " $values " == *" $argument "* ]]; then
            option=$argument
        fi
    done
    [ "$word" != '=' ] || word=
    if [ -z "$option$ended" ] && [[ $word == -* ]]; then
        mapfile -t COMPREPLY < <(compgen -W "$flags $values" -- "$word")
        return
    fi
    case "${COMP_WORDS[1]} ${option:-$operands}" in
)";

} // namespace

void WriteBash(std::ostream& out, const DescribedProgram& program) {
    std::vector<std::string> words;
    for (const DescribedCommand& command : program.commands) words.push_back(command.name);
    out << "# Completion of " << program.name << " for bash.\n_" << program.name
        << "() {\n    local word=${COMP_WORDS[COMP_CWORD]} flags='' values='' option='' ended='' operands=1 "
           "words argument i\n"
        << "    local endsHere='" << (program.isPlain ? "yes" : "")
        << "'\n    COMPREPLY=()\n    if [ \"$COMP_CWORD\" -eq 1 ]; then\n        words='"
        << Joined(words, " ") << "'\n        [[ $word != -* ]] || words='"
        << OptionWords(program.options, false)
        << "'\n        mapfile -t COMPREPLY < <(compgen -W \"$words\" -- \"$word\")\n        return\n    fi\n"
        << "    case ${COMP_WORDS[1]} in\n";
    for (const DescribedCommand& command : program.commands) WriteCommand(out, command);
    out << kWalk;
    for (const DescribedCommand& command : program.commands) WriteValues(out, command);
    out << "    esac\n}\ncomplete -o bashdefault -o default -F _" << program.name << ' ' << program.name
        << '\n';
}
