#pragma once

namespace ovrin_yaml {

/// How a conflict is to be settled: as a request (the default of a merge, a line of a resolve file) and as
/// the outcome that is recorded for every merged property.
///
///                      as a request                            as a recorded outcome
enum MergeResolve {
    ResolveNone = 0,       // never requested                      never recorded
    ResolveBase = 1,       // keep the base                        the change was dropped
    ResolveLeft = 2,       // take the left side                   the left side was taken
    ResolveRight = 3,      // take the right side                  the right side was taken
    ResolveMerged = 4,     // as if nothing were requested         merged or taken without a question
    ResolveConflict = 5,   // treat it as an open conflict         an open conflict, which is pending
    ResolveBlank = 6,      // put a blank in place of a conflict   never recorded
    ResolveBreakCycle = 7, // break a cycle of parents             the cycle was broken
};

} // namespace ovrin_yaml
