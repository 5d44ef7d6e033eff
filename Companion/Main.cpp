#include "Commands/CommandLine.h"
#include "Commands/MergeCommand.h"

int main(int argc, char** argv) {
    const std::string program = argc > 0 ? argv[0] : "";
    return static_cast<int>(
        ovrin::RunCommandLine(ovrin::ArgumentsFor(program, {argv + (argc > 0 ? 1 : 0), argv + argc})));
}
