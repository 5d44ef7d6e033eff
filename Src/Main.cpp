#include "CommandLine.h"
#include "ExitStatus.h"

#include <exception>
#include <iostream>
#include <new>

int main(int argc, char** argv) {
    try {
        CommandLineArguments arguments(argc, argv);
        return static_cast<int>(InnerMain(arguments));
    } catch (const std::bad_alloc&) {
        std::cerr << "Out of memory\n";
        return static_cast<int>(ExitStatus::Failed);
    } catch (const std::exception& error) {
        std::cerr << "Uncaught exception: " << error.what() << '\n';
        return static_cast<int>(ExitStatus::Failed);
    }
}
