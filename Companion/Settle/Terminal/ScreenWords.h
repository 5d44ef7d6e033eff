#pragma once

#include "Settle/Terminal/ConflictList.h"
#include "Settle/Terminal/Walk.h"

#include <string>
#include <vector>

namespace ovrin {

/// Words that the screen and the prompts share. Texts are as the model has them, lines as they are shown.

/// "12 of 50 open · Scenes/Harbour.ovrin".
std::string CountLine(const Walk& walk);
/// "merge: ours main, theirs topic"; empty where nothing is known.
std::string SidesLine(const Walk& walk);
/// What is missing, and what can be done about it under which number.
std::vector<StyledLine> ProblemLines(const Walk& walk, const Letters& letters);
/// "Which side for all that is open, in all scenes? o ours, t theirs, b base".
std::string QuestionForSide(const Walk& walk);
/// Why there is nothing to finish.
std::string NothingToFinish(const Walk& walk);
/// Whether to finish is a question: something is open, or problems are left in what is settled.
bool NeedsQuestion(const Walk& walk);
/// Whether to finish those scenes that are settled, with the problems that are left in them; empty if there
/// are none.
std::string QuestionToFinish(const Walk& walk);
/// Whether to replace the files that these remarks are about.
std::string QuestionToOverwrite(const Remarks& changedByHand);
/// A whole screen that is too small for anything else.
std::vector<StyledLine> TooSmall(Extent extent, Extent least);

} // namespace ovrin
