// Reads an object file on one thread, with nothing shared: as the program does, or with libyaml alone.

#include "FileUtils.h"
#include "Reading/ObjectFileReader.h"
#include "Values/YAMLScalar.h"

#include <cstdio>
#include <string>

int main(int argc, char** argv) {
    const bool byLibrary = argc == 3 && std::string(argv[1]) == "--library";
    if (argc != (byLibrary ? 3 : 2)) {
        std::fputs("usage: ReaderBench [--library] FILE\n", stderr);
        return 1;
    }
    ovrin_yaml::initialize();
    std::string bytes;
    if (ReadWholeFile(argv[argc - 1], bytes) != ReadResult::Complete) return 1;
    // The tree stays: taking it down is no part of reading.
    auto& objects = *new ovrin_yaml::OvrinObjects;
    ovrin_yaml::ParseYAMLFile(std::move(bytes), objects, {.fast = !byLibrary});
    return 0;
}
