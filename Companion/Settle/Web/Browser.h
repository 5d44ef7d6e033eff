#pragma once

#include <optional>
#include <string>
#include <sys/types.h>

namespace ovrin {

/// The browser of the user, as it was asked to open an address.
class Browser {
public:
    /// Asks what BROWSER names, or else the desktop. The program outlives this one, and hears nothing of it.
    explicit Browser(const std::string& address);
    Browser(const Browser&) = delete;
    Browser& operator=(const Browser&) = delete;

    /// Why the address couldn't be opened, as far as is known by now, once; a sentence without a full stop.
    std::optional<std::string> Problem();
    /// Whether it may still come to a problem.
    bool IsPending() const { return m_Process > 0; }

private:
    pid_t m_Process = 0;
    std::string m_Problem;
};

} // namespace ovrin
