#include "Settle/Web/Browser.h"

#include "Descriptor.h"
#include "Systems/ChildProcess.h"
#include "Words/Failure.h"

#include <cstdlib>
#include <fcntl.h>
#include <sstream>
#include <sys/wait.h>
#include <utility>
#include <vector>

namespace ovrin {

namespace {

bool IsSet(const char* variable) {
    const char* value = std::getenv(variable);
    return value && *value;
}

/// A command line of BROWSER, which passes no shell: words between spaces, "%s" for the address, which is the
/// last word where that isn't there.
CommandWords CommandOf(const std::string& line, const std::string& address) {
    CommandWords words;
    bool isNamed = false;
    std::istringstream stream(line);
    for (std::string word; stream >> word; words.push_back(word))
        if (const std::size_t place = word.find("%s"); place != std::string::npos) {
            word.replace(place, 2, address);
            isNamed = true;
        }
    if (!isNamed) words.push_back(address);
    return words;
}

/// The command lines to try, in their order.
std::vector<CommandWords> Commands(const std::string& address) {
    std::vector<CommandWords> commands;
    if (IsSet("BROWSER")) {
        std::istringstream lines(std::getenv("BROWSER"));
        for (std::string line; std::getline(lines, line, ':');)
            if (line.find_first_not_of(' ') != std::string::npos)
                commands.push_back(CommandOf(line, address));
    } else if (IsSet("DISPLAY") || IsSet("WAYLAND_DISPLAY")) {
        commands.push_back({"xdg-open", address});
    }
    return commands;
}

} // namespace

Browser::Browser(const std::string& address)
    : m_Problem("There is no desktop here, and BROWSER names no browser") {
    const Descriptor none = OpenFile("/dev/null", O_RDWR);
    for (const CommandWords& command : Commands(address)) {
        try {
            m_Process = StartProcess(command, {.isApart = true}, {none.Get(), none.Get(), none.Get()});
            m_Problem.clear();
            return;
        } catch (const Failure& failure) {
            m_Problem = failure.what();
        }
    }
}

std::optional<std::string> Browser::Problem() {
    int status = 0;
    if (m_Process > 0 && Uninterrupted([&] { return waitpid(m_Process, &status, WNOHANG); }) == m_Process) {
        m_Process = 0;
        if (status != 0) m_Problem = "The browser couldn't be opened";
    }
    if (m_Problem.empty()) return {};
    return std::exchange(m_Problem, {});
}

} // namespace ovrin
