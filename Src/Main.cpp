#include "CommandLine.h"

#include <exception>
#include <iostream>

int main(int argc, char** argv) {
    try {
        CommandLineArguments arguments(argc, argv);
        return InnerMain(arguments);
    } catch (const std::exception& error) {
        std::cerr << "Uncaught exception: " << error.what() << '\n';
        return 1;
    }
}
