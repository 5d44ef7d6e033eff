#include "SelfCheck.h"

#include "SelfCheckDiffs.h"
#include "SelfCheckOperations.h"

#include "Values/YAMLError.h"

#include <exception>
#include <iostream>

using namespace ovrin_yaml;

ExitStatus RunUnitttests() {
    try {
        TestResults results;
        self_check::TestOperations(results);
        self_check::TestDiffs(results);
        results.Output(std::cout);
        return ExitStatus::Done;
    } catch (const YAMLError& error) {
        std::cerr << "YAML error: " << error.what() << '\n';
    } catch (const std::exception& error) {
        std::cerr << "Exception: " << error.what() << '\n';
    }
    return ExitStatus::Failed;
}
