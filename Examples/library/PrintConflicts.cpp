// Merges two changes of a scene and prints the open conflicts by path.

#include "Diff/MergeRules.h"
#include "Diff/RulesReader.h"
#include "Diff/YAMLMappingDiff.h"
#include "Merge/DiffMerge.h"
#include "Merge/RecordingConflictResolver.h"
#include "Reading/ObjectFileReader.h"
#include "Repair/FileIDCollisions.h"
#include "Repair/PreProcess.h"
#include "Values/YAMLError.h"

#include <fstream>
#include <iostream>
#include <iterator>
#include <string>

using namespace ovrin_yaml;

namespace {

YAMLMapping& Read(const char* path, OvrinObjects& objects) {
    std::ifstream file(path, std::ios::binary);
    ParseYAMLFile(std::string(std::istreambuf_iterator<char>(file), {}), objects);
    PreProcess(objects.GetMapping());
    return objects.GetMapping();
}

void PrintConflicts(char** paths) {
    MergeRules rules;
    std::ifstream rulesFile(paths[0]);
    LoadSequenceUniqueKeys(rulesFile, rules);
    OvrinObjects files[3];
    const YAMLMapping& base = Read(paths[1], files[0]);
    const YAMLMapping& left = Read(paths[2], files[1]);
    YAMLMapping& right = Read(paths[3], files[2]);
    RemapCollidingAddFileIDs(CreateConflictingFileIDsRemapper(base, left, right), base, left, right);
    RecordingConflictResolver resolver(rules, ResolveBase);
    MergeMappingDiffs(YAMLMappingDiff::Diff(rules, &base, &left), YAMLMappingDiff::Diff(rules, &base, &right),
                      resolver);
    for (const auto& record : resolver.Records())
        if (record.resolve == ResolveConflict) std::cout << PathToString(record.path) << '\n';
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
