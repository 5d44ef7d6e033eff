// Merges two changes of a scene and prints the open conflicts by path.

#include "Diff/RulesReader.h"
#include "Session/MergeSession.h"

#include <fstream>
#include <iostream>
#include <iterator>

using namespace ovrin_yaml;

namespace {

InputFile FileInput(const char* path) {
    std::ifstream file(path, std::ios::binary);
    return TextInput(path, std::string(std::istreambuf_iterator<char>(file), {}));
}

void PrintConflicts(char** paths) {
    MergeRules rules;
    std::ifstream rulesFile(paths[0]);
    LoadSequenceUniqueKeys(rulesFile, rules);
    MergeSession session;
    session.SetRules(std::move(rules));
    session.Read({FileInput(paths[1]), FileInput(paths[2]), FileInput(paths[3])});
    session.Prepare();
    session.Diff();
    session.Merge();
    session.Apply();
    session.Repair();
    for (const auto* conflict : session.PendingConflicts()) std::cout << PathToString(conflict->path) << '\n';
}

} // namespace

int main(int count, char** arguments) {
    if (count != 5) {
        std::cerr << "Usage: PrintConflicts RULES BASE LEFT RIGHT\n";
        return 1;
    }
    initialize();
    try {
        PrintConflicts(arguments + 1);
    } catch (const YAMLError& error) {
        std::cerr << error.what() << '\n';
        return 1;
    }
    return 0;
}
