#pragma once

#include "Setup/Configuration.h"
#include "Setup/ProgramCall.h"

#include <string>

namespace ovrin {

/// What git needs: the merge driver, diffs and tools, and the attributes of scenes; in a repository also the
/// guard, by which a commit fails that holds an unsettled scene. Throws Failure where git has no place for
/// it.
SystemSetup SetupOfGit(Scope scope, const ProgramCall& program);

/// The same with all places in which an earlier set-up may have left something.
SystemSetup RemovalFromGit(Scope scope, const ProgramCall& program);

/// The attributes by which git gives scenes to the program, a line for each kind of scene.
std::string AttributeLines();

} // namespace ovrin
