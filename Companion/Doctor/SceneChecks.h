#pragma once

#include "Doctor/Finding.h"

namespace ovrin {

class Patient;

/// Whether git changes line ends in scenes, which the editor and the program write in one way everywhere.
Finding LookAtLineEnds(Patient& patient);
/// Whether Git LFS has scenes, of which a merge then sees pointers only.
Finding LookAtLfs(Patient& patient);
/// Whether scenes are of another editor's tag authority than this build writes.
Finding LookAtTagAuthority(Patient& patient);
/// Whether merges of scenes wait for a person.
Finding LookAtOpenConflicts(Patient& patient);

} // namespace ovrin
