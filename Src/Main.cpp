#include "CommandLine.h"

#include <exception>
#include <iostream>
#include <new>

int main(int argc, char** argv) {
    try {
        CommandLineArguments arguments(argc, argv);
        return InnerMain(arguments);
    } catch (const std::bad_alloc&) {
        std::cerr << "Out of memory\n";
        return 1;
    } catch (const std::exception& error) {
        std::cerr << "Uncaught exception: " << error.what() << '\n';
        return 1;
    }
}
