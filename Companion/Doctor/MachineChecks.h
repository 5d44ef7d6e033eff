#pragma once

#include "Doctor/Finding.h"

namespace ovrin {

class Patient;

/// Whether Mercurial gives scenes to the program.
Finding LookAtMercurial(Patient& patient);
/// Whether Subversion has the program as its merge tool.
Finding LookAtSubversion(Patient& patient);
/// Whether the tools are there that the merge spec file names.
Finding LookAtMergeTools(Patient& patient);
/// Whether merges left files in the temporary directory.
Finding LookAtTemporaryFiles(Patient& patient);

} // namespace ovrin
