#pragma once

#include "Doctor/Diagnosis.h"

namespace ovrin {

class Patient;

/// Whether Mercurial gives scenes to the program.
Diagnosis LookAtMercurial(Patient& patient);
/// Whether Subversion has the program as its merge tool.
Diagnosis LookAtSubversion(Patient& patient);
/// Whether the tools are there that the merge spec file names.
Diagnosis LookAtMergeTools(Patient& patient);
/// Whether merges left files in the temporary directory.
Diagnosis LookAtTemporaryFiles(Patient& patient);

} // namespace ovrin
