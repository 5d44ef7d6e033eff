#pragma once

#include "Doctor/Finding.h"

namespace ovrin {

class Patient;

/// Whether git can do what the program asks of it.
Finding LookAtGitVersion(Patient& patient);
/// Whether git knows the merge driver, and it is the one that set-up writes today.
Finding LookAtGitDriver(Patient& patient);
/// Whether git gives the scenes to the driver.
Finding LookAtGitAttributes(Patient& patient);
/// Whether git finds the program that the driver names.
Finding LookAtGitPath(Patient& patient);
/// Whether something keeps unsettled scenes from being committed.
Finding LookAtGuard(Patient& patient);
/// Whether configurations name what earlier versions had.
Finding LookAtOldSetup(Patient& patient);

} // namespace ovrin
