// Writes what stands of commands and options outside the program into a folder: completion files, which are
// installed, and the lines that the manual and the README must have, which check-manuals compares.

#include "CommandTable.h"

#include <fstream>
#include <iostream>
#include <string>
#include <string_view>
#include <vector>

namespace {

/// -l or --fallback FILE.
std::string Form(const Option& option) {
    const std::string word(option.word);
    return option.value.empty() ? word : word + " " + std::string(option.value);
}

/// The options of a command, of all its groups.
std::vector<Option> OptionsOf(const Command& command) {
    std::vector<Option> options;
    for (const auto& group : command.options) options.insert(options.end(), group.begin(), group.end());
    return options;
}

void AddWord(std::string& text, std::string_view word) {
    (text += text.empty() ? "" : " ") += word;
}

std::string CommandWords() {
    std::string text;
    for (const Command& command : kCommands) AddWord(text, command.word);
    return text;
}

/// The words of the options that take a value, or of those that don't.
std::string OptionWords(const Command& command, bool withValue) {
    std::string text;
    for (const Option& option : OptionsOf(command))
        if (option.value.empty() != withValue) AddWord(text, option.word);
    return text;
}

/// bash tells values from paths by itself: options end at the first path.
void WriteBash(std::ostream& out) {
    out << R"(# Completion of OvrinMerge for bash.
_OvrinMerge() {
    local word=${COMP_WORDS[COMP_CWORD]} expected=option flags='' values='' i
    COMPREPLY=()
    if [ "$COMP_CWORD" -eq 1 ]; then
        mapfile -t COMPREPLY < <(compgen -W ")"
        << CommandWords() << R"(" -- "$word")
        return
    fi
    case ${COMP_WORDS[1]} in
)";
    for (const Command& command : kCommands)
        out << "    " << command.word << ")\n        flags='" << OptionWords(command, false)
            << "'\n        values='" << OptionWords(command, true) << "'\n        ;;\n";
    out << R"(    esac
    for ((i = 2; i < COMP_CWORD; ++i)); do
        if [ "$expected" = value ]; then
            expected=option
        elif [[ " $values " == *" ${COMP_WORDS[i]} "* ]]; then
            expected=value
        elif [[ " $flags " != *" ${COMP_WORDS[i]} "* ]]; then
            return
        fi
    done
    if [ "$expected" = option ] && [[ $word == -* ]]; then
        mapfile -t COMPREPLY < <(compgen -W "$flags $values" -- "$word")
    elif [ "$expected" = value ]; then
        case ${COMP_WORDS[COMP_CWORD - 1]} in
)";
    for (const Option& option : OptionsOf(kCommands.front()))
        if (!option.notAFile.empty())
            out << "        " << option.word << ") mapfile -t COMPREPLY < <(compgen -f -W " << option.notAFile
                << " -- \"$word\") && compopt -o filenames 2>/dev/null ;;\n";
    out << R"(        esac
    fi
}
# Without a match above, readline completes file names.
complete -o bashdefault -o default -F _OvrinMerge OvrinMerge
)";
}

void WriteZshOption(std::ostream& out, const Option& option) {
    out << " \\\n        '" << option.word << '[' << option.meaning << ']';
    if (!option.value.empty()) out << ':' << option.value << ':';
    if (!option.notAFile.empty())
        out << "{compadd " << option.notAFile << "; _files}";
    else if (!option.value.empty())
        out << "_files";
    out << '\'';
}

void WriteZsh(std::ostream& out) {
    out << R"(#compdef OvrinMerge
# Completion of OvrinMerge for zsh.
if (( CURRENT == 2 )); then
    local -a commands=(
)";
    for (const Command& command : kCommands)
        out << "        '" << command.word << ':' << command.meaning << "'\n";
    out << R"(    )
    _describe command commands
    return
fi
shift words
(( CURRENT-- ))
case $words[1] in
)";
    for (const Command& command : kCommands) {
        if (command.paths.empty()) continue;
        // No options behind the first path.
        out << command.word << ")\n    _arguments -A '-*'";
        for (const Option& option : OptionsOf(command)) WriteZshOption(out, option);
        for (std::size_t i = 0; i < command.paths.size(); ++i)
            out << " \\\n        '" << i + 1 << (i < command.requiredPaths ? ":" : "::")
                << command.paths[i].name << ":_files'";
        out << "\n    ;;\n";
    }
    out << "esac\n";
}

void WriteFishOption(std::ostream& out, const Command& command, const Option& option) {
    const bool isLong = option.word.starts_with("--");
    out << "complete -c OvrinMerge -n '__OvrinMerge_runs " << command.word << "' " << (isLong ? "-l " : "-o ")
        << option.word.substr(isLong ? 2 : 1);
    if (!option.value.empty()) out << " -r -F";
    if (!option.notAFile.empty()) out << " -a " << option.notAFile;
    out << " -d '" << option.meaning << "'\n";
}

void WriteFish(std::ostream& out) {
    out << R"(# Completion of OvrinMerge for fish.
function __OvrinMerge_runs --argument-names command
    set -l words (commandline -opc)
    test "$words[2]" = "$command"
end
)";
    for (const Command& command : kCommands)
        out << "complete -c OvrinMerge -n '__OvrinMerge_runs \"\"' -f -a " << command.word << " -d '"
            << command.meaning << "'\n";
    for (const Command& command : kCommands)
        for (const Option& option : OptionsOf(command)) WriteFishOption(out, command, option);
}

/// BASE LEFT RIGHT [DEST [PREMERGED_BASE [PREMERGED_RIGHT]]]
std::string PathForms(const Command& command) {
    std::string text;
    for (std::size_t i = 0; i < command.paths.size(); ++i)
        text += (i < command.requiredPaths ? " " : " [") + std::string(command.paths[i].name);
    return text + std::string(command.paths.size() - command.requiredPaths, ']');
}

void WriteSynopsis(std::ostream& out) {
    for (const Command& command : kCommands) {
        out << "OvrinMerge " << command.word;
        if (&command == &kCommands.front())
            out << " [options]";
        else
            for (const Option& option : OptionsOf(command)) out << " [" << Form(option) << ']';
        out << PathForms(command) << '\n';
    }
}

void WriteOptions(std::ostream& out) {
    for (const Option& option : OptionsOf(kCommands.front())) out << Form(option) << '\n';
}

void WriteReadmeTable(std::ostream& out) {
    for (const Option& option : OptionsOf(kCommands.front()))
        out << "| `" << Form(option) << "` | " << option.meaning << " |\n";
}

} // namespace

int main(int argc, char** argv) {
    const struct {
        const char* name;
        void (*write)(std::ostream&);
    } files[] = {{"completion.bash", WriteBash}, {"completion.zsh", WriteZsh},
                 {"completion.fish", WriteFish}, {"synopsis", WriteSynopsis},
                 {"options", WriteOptions},      {"readme-table", WriteReadmeTable}};
    if (argc != 2) return EXIT_FAILURE;
    for (const auto& [name, write] : files) {
        std::ofstream file(std::string(argv[1]) + "/" + name);
        write(file);
        if (!file.flush()) {
            std::cerr << "Cannot write " << name << '\n';
            return EXIT_FAILURE;
        }
    }
}
