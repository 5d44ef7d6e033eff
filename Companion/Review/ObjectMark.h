#pragma once

#include <cstddef>

namespace ovrin {

/// What became of an object, for a person who looks for it in a tree.
enum class MarkKind : unsigned char { Same, Added, Removed, Changed, Moved };

/// What the sides of a merge did to an object, together. Where they did different things the one that is
/// seen from farthest counts: an object that one side added and that isn't there without it, then one that is
/// gone, then one that stands elsewhere, whatever else changed about it.
struct ObjectMark {
    MarkKind kind = MarkKind::Same;
    bool byOurs = false, byTheirs = false; ///< who did it
    bool isChanged = false;                ///< of what is there in both: its properties differ
    bool isMoved = false;                  ///< it stands under another parent

    bool IsTouched() const { return kind != MarkKind::Same; }
};

/// "added", "removed", "changed", "moved", "same".
const char* MarkName(MarkKind kind);
/// "ours", "theirs", "both", or null where nobody did anything.
const char* AuthorName(const ObjectMark& mark);

/// Objects that were touched; one that was moved and changed counts as both.
struct MarkCounts {
    std::size_t added = 0, removed = 0, changed = 0, moved = 0;

    void Add(const ObjectMark& mark);
};

} // namespace ovrin
