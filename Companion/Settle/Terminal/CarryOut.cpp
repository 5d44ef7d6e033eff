#include "Settle/Terminal/CarryOut.h"

#include <algorithm>
#include <cstddef>

namespace ovrin {

namespace {

/// By the lines of the list.
void Move(Walk& walk, Request request) {
    const std::size_t at = walk.At(), last = walk.Stops().size() - 1;
    walk.Say("");
    switch (request) {
    case Request::Up:
        return walk.GoTo(at - std::min<std::size_t>(at, 1));
    case Request::Down:
        return walk.GoTo(std::min(at + 1, last));
    case Request::First:
        return walk.GoTo(0);
    default:
        return walk.GoTo(last);
    }
}

} // namespace

bool MakesStep(Request request) {
    return SideOf(request) || request == Request::Proposed || request == Request::Remedy ||
           request == Request::Undo || request == Request::Redo;
}

void CarryOut(Walk& walk, Request request, Key key) {
    switch (request) {
    case Request::NextOpen:
        return walk.GoToNextOpen();
    case Request::PreviousOpen:
        return walk.GoToPreviousOpen();
    case Request::Ours:
    case Request::Theirs:
    case Request::Base:
        return walk.Take(*SideOf(request));
    case Request::WholeOurs:
    case Request::WholeTheirs:
    case Request::WholeBase:
        return walk.TakeWhole(*SideOf(request));
    case Request::Proposed:
        return walk.TakeProposed();
    case Request::Remedy:
        return walk.Mend(static_cast<std::size_t>(key) - static_cast<std::size_t>(KeyOf('1')));
    case Request::Undo:
        return walk.Undo();
    case Request::Redo:
        return walk.Redo();
    case Request::Up:
    case Request::Down:
    case Request::First:
    case Request::Last:
        return Move(walk, request);
    default:
        return;
    }
}

} // namespace ovrin
