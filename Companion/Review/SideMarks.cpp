#include "Review/SideMarks.h"

#include "Changes/ChangedObjects.h"

#include "Session/MergeSession.h"

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = MergeNames::ID;
using Marks = std::unordered_map<ID, ObjectMark>;

MarkKind KindOf(const ChangedObjects::Change& change) {
    if (change.kind == ChangeKind::Added) return MarkKind::Added;
    if (change.kind == ChangeKind::Removed) return MarkKind::Removed;
    return change.isMoved ? MarkKind::Moved : MarkKind::Changed;
}

int RankOf(MarkKind kind) {
    switch (kind) {
    case MarkKind::Added:
        return 4;
    case MarkKind::Removed:
        return 3;
    case MarkKind::Moved:
        return 2;
    case MarkKind::Changed:
        return 1;
    default:
        return 0;
    }
}

bool IsThereInBoth(MarkKind kind) {
    return kind == MarkKind::Changed || kind == MarkKind::Moved;
}

ObjectMark MarkOf(const ChangedObjects::Change& change, bool ObjectMark::*author) {
    ObjectMark mark;
    mark.kind = KindOf(change);
    mark.*author = true;
    mark.isMoved = change.isMoved;
    mark.isChanged = change.kind == ChangeKind::Changed;
    return mark;
}

/// Who moved and who changed an object did both something that is seen; who changed what another removed
/// didn't remove it.
ObjectMark Together(const ObjectMark& one, const ObjectMark& other) {
    ObjectMark mark = RankOf(one.kind) >= RankOf(other.kind) ? one : other;
    if (one.kind == other.kind || (IsThereInBoth(one.kind) && IsThereInBoth(other.kind))) {
        mark.byOurs = one.byOurs || other.byOurs;
        mark.byTheirs = one.byTheirs || other.byTheirs;
        mark.isMoved = one.isMoved || other.isMoved;
        mark.isChanged = one.isChanged || other.isChanged;
    }
    return mark;
}

void AddSide(const MergeSession& session, const MergeNames& names, Version version, Marks& marks) {
    const bool isOurs = version == Version::Ours;
    ChangedObjects changed(names.In(Version::Base), names.In(version),
                           isOurs ? session.RightDiff() : session.LeftDiff(), session.Rules());
    for (const ID id : changed.Candidates())
        if (const auto change = changed.Find(id)) {
            ObjectMark& mark = marks[id];
            mark = Together(mark, MarkOf(*change, isOurs ? &ObjectMark::byOurs : &ObjectMark::byTheirs));
        }
}

} // namespace

Marks FindMarks(const MergeSession& session, const MergeNames& names) {
    Marks marks;
    AddSide(session, names, Version::Ours, marks);
    AddSide(session, names, Version::Theirs, marks);
    return marks;
}

} // namespace ovrin
