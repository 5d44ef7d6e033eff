#include "Settle/Steps.h"

#include "Settle/SettleSession.h"

#include <algorithm>
#include <cstdint>

namespace ovrin {

namespace {

std::uint64_t LastStepOf(Sessions sessions) {
    std::uint64_t last = 0;
    for (const auto& session : sessions) last = std::max(last, session->LastStep());
    return last;
}

} // namespace

void BeginStep(Sessions sessions) {
    const std::uint64_t number = LastStepOf(sessions) + 1;
    for (const auto& session : sessions) {
        session->NumberSteps(number);
        session->ForgetUndone();
    }
}

bool UndoStep(Sessions sessions) {
    const std::uint64_t last = LastStepOf(sessions);
    if (last == 0) return false;
    for (const auto& session : sessions)
        while (session->LastStep() == last) session->Undo();
    return true;
}

bool RedoStep(Sessions sessions) {
    std::uint64_t next = 0;
    for (const auto& session : sessions)
        if (const std::uint64_t undone = session->NextUndone(); undone && (!next || undone < next))
            next = undone;
    if (next == 0) return false;
    for (const auto& session : sessions)
        while (session->NextUndone() == next) session->Redo();
    return true;
}

} // namespace ovrin
