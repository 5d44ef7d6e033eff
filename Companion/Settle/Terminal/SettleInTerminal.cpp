#include "Settle/Terminal/SettleInTerminal.h"

#include "Settle/Terminal/Curses.h"
#include "Settle/Terminal/Prompts.h"
#include "Settle/Terminal/Screen.h"

#include <iostream>
#include <unistd.h>

namespace ovrin {

namespace {

constexpr const char* kLeft = "\novrin: what you decided is kept; \"ovrin settle\" goes on\n";

/// Scenes of so many bytes are merged in a time that is felt.
constexpr std::size_t kFelt = std::size_t{4} << 20;

bool AreLarge(const Walk& walk) {
    std::size_t bytes = 0;
    for (const auto& session : walk.Desk().Scenes()) bytes += session->Source().texts.ours.size();
    return bytes >= kFelt;
}

TerminalEnd SettleOnScreen(Walk& walk, const Letters& letters, Curses& curses) {
    Screen screen(walk, letters);
    const bool areLarge = AreLarge(walk);
    while (!screen.End()) {
        curses.Show(screen.Draw(curses.Size()));
        const auto key = curses.Read();
        if (!key) return screen.Reached();
        if (areLarge && screen.IsStep(*key)) curses.Show(screen.DrawWorking(curses.Size()));
        screen.Press(*key);
    }
    return *screen.End();
}

} // namespace

bool IsPersonThere() {
    return isatty(STDIN_FILENO) == 1 && isatty(STDOUT_FILENO) == 1;
}

TerminalEnd SettleInTerminal(SettleDesk& desk, bool wantsPrompts) {
    Walk walk(desk);
    const Letters letters = Letters::OfEnvironment();
    if (!wantsPrompts && IsPersonThere())
        if (const auto curses = Curses::Open(kLeft)) return SettleOnScreen(walk, letters, *curses);
    return SettleByPrompts(walk, letters, std::cin, std::cout);
}

} // namespace ovrin
