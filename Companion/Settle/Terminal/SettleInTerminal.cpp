#include "Settle/Terminal/SettleInTerminal.h"

#include "Settle/Terminal/Curses.h"
#include "Settle/Terminal/Prompts.h"
#include "Settle/Terminal/Screen.h"

#include <iostream>
#include <unistd.h>

namespace ovrin {

namespace {

constexpr const char* kLeft = "\novrin: what you decided is kept; \"ovrin settle\" goes on\n";

TerminalEnd SettleOnScreen(Walk& walk, const Letters& letters, Curses& curses) {
    Screen screen(walk, letters);
    while (!screen.End()) {
        curses.Show(screen.Draw(curses.Size()));
        const auto key = curses.Read();
        if (!key) return {};
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
