#include "TestResults.h"

#include <algorithm>
#include <cctype>
#include <ostream>

void TestResults::Add(const std::string& name, bool passed) {
    TestResult result{name, passed};
    const auto isSign = [](unsigned char character) { return !std::isalnum(character); };
    std::replace_if(result.name.begin(), result.name.end(), isSign, '_');
    m_Results.push_back(std::move(result));
}

void TestResults::Output(std::ostream& out) const {
    for (const TestResult& result : m_Results)
        out << "[OvrinMergeNative]\t\t" << result.name << "\t\t" << (result.passed ? "PASS" : "FAIL")
            << " (0ms)\n";
}
