#include "Review/ObjectMark.h"

namespace ovrin {

const char* MarkName(MarkKind kind) {
    switch (kind) {
    case MarkKind::Added:
        return "added";
    case MarkKind::Removed:
        return "removed";
    case MarkKind::Changed:
        return "changed";
    case MarkKind::Moved:
        return "moved";
    default:
        return "same";
    }
}

const char* AuthorName(const ObjectMark& mark) {
    if (mark.byOurs && mark.byTheirs) return "both";
    if (mark.byOurs) return "ours";
    return mark.byTheirs ? "theirs" : nullptr;
}

void MarkCounts::Add(const ObjectMark& mark) {
    added += mark.kind == MarkKind::Added;
    removed += mark.kind == MarkKind::Removed;
    changed += mark.isChanged;
    moved += mark.isMoved;
}

} // namespace ovrin
