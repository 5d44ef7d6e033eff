// Writes what stands of commands and options outside the programs into a folder: completion files, which are
// installed, and the lines that the manual and the README must have, which check-manuals compares.

#include "Describe/BashCompletion.h"
#include "Describe/CompanionProgram.h"
#include "Describe/Documents.h"
#include "Describe/FishCompletion.h"
#include "Describe/MergeProgram.h"
#include "Describe/ZshCompletion.h"

#include <fstream>
#include <iostream>

int main(int argc, char** argv) {
    const DescribedProgram merge = DescribeMerge();
    const DescribedProgram companion = DescribeCompanion();
    const struct {
        const char* name;
        void (*write)(std::ostream&, const DescribedProgram&);
        const DescribedProgram& program;
    } files[] = {{"OvrinMerge.bash", WriteBash, merge},       {"OvrinMerge.zsh", WriteZsh, merge},
                 {"OvrinMerge.fish", WriteFish, merge},       {"OvrinMerge.synopsis", WriteSynopsis, merge},
                 {"OvrinMerge.options", WriteOptions, merge}, {"OvrinMerge.readme", WriteReadmeTable, merge},
                 {"ovrin.bash", WriteBash, companion},        {"ovrin.zsh", WriteZsh, companion},
                 {"ovrin.fish", WriteFish, companion},        {"ovrin.commands", WriteCommands, companion},
                 {"ovrin.words", WriteWords, companion}};
    if (argc != 2) return EXIT_FAILURE;
    for (const auto& [name, write, program] : files) {
        std::ofstream file(std::string(argv[1]) + "/" + name);
        write(file, program);
        if (!file.flush()) {
            std::cerr << "Cannot write " << name << '\n';
            return EXIT_FAILURE;
        }
    }
}
