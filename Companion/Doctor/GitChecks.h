#pragma once

#include "Doctor/Diagnosis.h"

namespace ovrin {

class Patient;

/// Whether git can do what the program asks of it.
Diagnosis LookAtGitVersion(Patient& patient);
/// Whether git knows the merge driver, and it is the one that set-up writes today.
Diagnosis LookAtGitDriver(Patient& patient);
/// Whether git gives the scenes to the driver.
Diagnosis LookAtGitAttributes(Patient& patient);
/// Whether git finds the program that the driver names.
Diagnosis LookAtGitPath(Patient& patient);
/// Whether something keeps unsettled scenes from being committed.
Diagnosis LookAtGuard(Patient& patient);
/// Whether configurations name what earlier versions had.
Diagnosis LookAtOldSetup(Patient& patient);

} // namespace ovrin
