#include "Commands/CommandLine.h"

int main(int argc, char** argv) {
    return static_cast<int>(ovrin::RunCommandLine({argv + 1, argv + argc}));
}
