#include "Systems/Pager.h"

#include "Systems/ChildProcess.h"

#include <csignal>
#include <cstdlib>
#include <unistd.h>

namespace ovrin {

std::string ChosenPager() {
    const char* chosen = std::getenv("PAGER");
    std::string pager = chosen ? chosen : "less";
    if (!FindProgram("git").empty()) pager = RunProcess({"git", "var", "GIT_PAGER"}).output;
    while (pager.ends_with('\n')) pager.pop_back();
    return pager == "cat" ? "" : pager;
}

Pager::Pager(const std::string& commandLine) {
    Pipe text;
    ProcessSetting setting;
    // As git has it: left at once where all fits on a page, and colours as such.
    if (!std::getenv("LESS")) setting.environment.emplace_back("LESS", "FRX");
    if (!std::getenv("LV")) setting.environment.emplace_back("LV", "-c");
    m_Child =
        StartProcess({"sh", "-c", commandLine}, setting, {text.read.Get(), STDOUT_FILENO, STDERR_FILENO});
    m_ToChild = std::move(text.write);
    // The keyboard is the pager's: what it takes for an interrupt must not leave it behind alone.
    std::signal(SIGINT, SIG_IGN);
}

Pager::~Pager() {
    m_ToChild.Close();
    WaitForProcess(m_Child);
    std::signal(SIGINT, SIG_DFL);
}

bool Pager::Write(std::string_view text) {
    if (m_ToChild.IsOpen() && WriteFully(m_ToChild.Get(), text.data(), text.size()) != 0) m_ToChild.Close();
    return m_ToChild.IsOpen();
}

} // namespace ovrin
