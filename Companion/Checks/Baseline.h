#pragma once

#include "Checks/Finding.h"

#include <cstddef>
#include <map>
#include <string>
#include <tuple>
#include <vector>

namespace ovrin {

/// Findings that were there before, and are accepted. A finding is the same whatever line it stands in: it
/// goes by its code, file, object and detail. Of several that are the same as many are accepted as there
/// were.
class Baseline {
public:
    /// Accepts nothing.
    Baseline() = default;
    /// Reads what "check --json" wrote. Throws Failure that names the file.
    explicit Baseline(const std::string& path);

    /// Takes those that are accepted out of the findings.
    void Accept(CheckedScene& scene);
    std::size_t Accepted() const { return m_Accepted; }
    /// Those that nobody found again.
    std::size_t Left() const { return m_Left; }

private:
    using Identity = std::tuple<std::string, std::string, std::string, std::string>;

    std::map<Identity, std::size_t> m_Known;
    std::size_t m_Accepted = 0, m_Left = 0;
};

} // namespace ovrin
