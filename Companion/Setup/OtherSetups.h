#pragma once

#include "Setup/Configuration.h"
#include "Setup/ProgramCall.h"

namespace ovrin {

/// What Mercurial needs: a merge tool for scenes. Throws Failure where it has no place for it.
SystemSetup SetupOfMercurial(Scope scope, const ProgramCall& program);

/// The same with all places in which an earlier set-up may have left something.
SystemSetup RemovalFromMercurial(Scope scope, const ProgramCall& program);

/// What Subversion needs: its one merge tool, unless somebody set another one. There is no configuration of a
/// single working copy. Throws Failure where it has no place for it.
SystemSetup SetupOfSubversion(const ProgramCall& program);

/// The same without a look at what stands there.
SystemSetup RemovalFromSubversion(const ProgramCall& program);

/// The merge tool that a configuration of Subversion names, with blanks around it taken off; empty if none.
std::string MergeToolOfSubversion(const std::string& text);

/// Whether such a tool is this program, in whatever folder.
bool IsOurToolOfSubversion(const std::string& tool);

} // namespace ovrin
