#pragma once

#include "Settle/Terminal/Letters.h"
#include "Settle/Terminal/TerminalEnd.h"
#include "Settle/Terminal/Walk.h"

#include <iosfwd>

namespace ovrin {

/// Settles by questions and answers, a line each: one conflict at a time, the same letters and words as on
/// the screen. For terminals that can do no more, and for whoever would rather read lines. The end of the
/// input leaves.
TerminalEnd SettleByPrompts(Walk& walk, const Letters& letters, std::istream& input, std::ostream& output);

} // namespace ovrin
