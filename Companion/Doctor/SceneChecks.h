#pragma once

#include "Doctor/Diagnosis.h"

namespace ovrin {

class Patient;

/// Whether git changes line ends in scenes, which the editor and the program write in one way everywhere.
Diagnosis LookAtLineEnds(Patient& patient);
/// Whether Git LFS has scenes, of which a merge then sees pointers only.
Diagnosis LookAtLfs(Patient& patient);
/// Whether scenes are of another editor's tag authority than this build writes.
Diagnosis LookAtTagAuthority(Patient& patient);
/// Whether merges of scenes wait for a person.
Diagnosis LookAtOpenConflicts(Patient& patient);

} // namespace ovrin
