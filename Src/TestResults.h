#pragma once

#include <iosfwd>
#include <string>
#include <vector>

struct TestResult {
    std::string name;
    bool passed;
};

/// The outcome of the built-in checks, in their order.
class TestResults {
public:
    /// Whatever is no letter or digit in `name` becomes "_".
    void Add(const std::string& name, bool passed);
    /// Writes a line for each result.
    void Output(std::ostream& out) const;

private:
    std::vector<TestResult> m_Results;
};
