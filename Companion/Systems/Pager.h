#pragma once

#include "Descriptor.h"

#include <string>
#include <string_view>
#include <sys/types.h>

namespace ovrin {

/// The command line of the pager that git would use, for a shell; empty for none.
std::string ChosenPager();

/// A program that shows text on the terminal page by page.
class Pager {
public:
    /// Starts it. Throws Failure.
    explicit Pager(const std::string& commandLine);
    Pager(const Pager&) = delete;
    Pager& operator=(const Pager&) = delete;
    /// Waits until the user leaves it.
    ~Pager();

    /// False once the user left it.
    bool Write(std::string_view text);

private:
    pid_t m_Child;
    Descriptor m_ToChild;
};

} // namespace ovrin
