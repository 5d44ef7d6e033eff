#pragma once

#include "Settle/SettleDesk.h"
#include "Settle/Terminal/TerminalEnd.h"

namespace ovrin {

/// Whether a person is there to be asked: standard input and output are a terminal.
bool IsPersonThere();

/// Lets a person settle what is on the desk, which has a scene at least: on a screen, or by prompts on
/// standard input and output where they are wanted or the terminal has no screen. Throws Failure as the desk
/// does before the first question; later ones are told to the person.
TerminalEnd SettleInTerminal(SettleDesk& desk, bool wantsPrompts);

} // namespace ovrin
