#include "Doctor/MachineChecks.h"

#include "Doctor/Patient.h"
#include "Doctor/SetupFix.h"
#include "Doctor/TemporaryFiles.h"
#include "Setup/OtherSetups.h"
#include "Setup/UserFolders.h"
#include "Systems/Process.h"
#include "Words/Failure.h"

#include "Fallback.h"
#include "FileUtils.h"

#include <cerrno>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

/// What a system that nobody set up is: a problem only where its repository has scenes.
Diagnosis NotSetUp(Patient& patient, SystemKind kind, const std::string& system, const std::string& name) {
    const bool isNeeded = patient.IsIn(kind) && !patient.Scenes().empty();
    Diagnosis diagnosis = {isNeeded ? Health::Problem : Health::Note, name + " is not set up to merge scenes",
                           "ovrin setup " + system};
    if (isNeeded) diagnosis.fix = FixBySetup(system, Scope::Global);
    return diagnosis;
}

Diagnosis MissingProgram(const std::string& system, const std::string& name, const std::string& call) {
    return {Health::Problem, name + " is to call " + call + ", which is not there", "ovrin setup " + system,
            FixBySetup(system, Scope::Global)};
}

bool ShellFinds(const std::string& call) {
    return RunProcess({"sh", "-c", "command -v " + call}).Succeeded();
}

std::string MissingTools(const FallbackCommandMap& tools) {
    std::string missing;
    for (const auto& [extension, entries] : tools)
        for (const FallbackCommandEntry& entry : entries)
            if (!FileExists(entry.path.c_str())) missing += (missing.empty() ? "" : ", ") + entry.path;
    return missing;
}

bool HasTool(const FallbackCommandMap& tools) {
    for (const auto& [extension, entries] : tools)
        for (const FallbackCommandEntry& entry : entries)
            if (FileExists(entry.path.c_str())) return true;
    return false;
}

std::string RemoveAll(const std::vector<std::string>& files) {
    for (const std::string& file : files)
        if (unlink(file.c_str()) != 0 && errno != ENOENT)
            throw Failure("Cannot remove " + file + ": " + std::system_category().message(errno));
    return std::to_string(files.size()) + " files were removed";
}

} // namespace

Diagnosis LookAtMercurial(Patient& patient) {
    if (FindProgram("hg").empty()) return {Health::Skipped, "Mercurial is not installed"};
    const std::string arguments = AnswerOf({"hg", "config", "merge-tools.ovrin.args"});
    if (arguments.empty()) return NotSetUp(patient, SystemKind::Mercurial, "hg", "Mercurial");
    const std::size_t end = arguments.find(" merge -- $base ");
    if (end == std::string::npos)
        return {Health::Problem, "Mercurial has another tool for scenes than set-up writes: " + arguments,
                "ovrin setup hg", FixBySetup("hg", Scope::Global)};
    const std::string call = arguments.substr(0, end);
    if (!ShellFinds(call)) return MissingProgram("hg", "Mercurial", call);
    if (!VariableOf("HGMERGE").empty())
        return {Health::Problem,
                "HGMERGE is set to " + VariableOf("HGMERGE") + ", which Mercurial takes for scenes too",
                "unset HGMERGE, and name that tool as ui.merge"};
    return {Health::Fine, "Mercurial merges scenes with " + call};
}

Diagnosis LookAtSubversion(Patient& patient) {
    if (FindProgram("svn").empty()) return {Health::Skipped, "Subversion is not installed"};
    const std::string path = HomeFor("Subversion") + "/.subversion/config";
    std::string text;
    ReadWholeFile(path, text);
    const std::string tool = MergeToolOfSubversion(text);
    if (tool.empty()) return NotSetUp(patient, SystemKind::Subversion, "svn", "Subversion");
    if (tool.ends_with("ovrinmerge-vcs"))
        return {Health::Problem, path + " names " + tool + ", which is of an earlier version",
                "ovrin setup svn", FixBySetup("svn", Scope::Global)};
    if (!IsOurToolOfSubversion(tool))
        return {patient.IsIn(SystemKind::Subversion) ? Health::Problem : Health::Note,
                path + " has another merge tool: " + tool,
                "take its merge-tool-cmd out, then \"ovrin setup svn\""};
    const bool isThere =
        tool.find('/') == std::string::npos ? !FindProgram(tool).empty() : access(tool.c_str(), X_OK) == 0;
    if (!isThere) return MissingProgram("svn", "Subversion", tool);
    if (!VariableOf("SVN_MERGE").empty())
        return {Health::Problem,
                "SVN_MERGE is set to " + VariableOf("SVN_MERGE") + ", which wins over " + path,
                "unset SVN_MERGE"};
    return {Health::Fine, "Subversion merges with " + tool};
}

Diagnosis LookAtMergeTools(Patient&) {
    const std::string file = GetSpecFilename(kDefaultSpecFile);
    if (!FileExists(file.c_str()))
        return {Health::Problem, file + ", which names the merge tools, is missing or can't be read",
                "install the program whole, or write ~/.mergespecfile.txt, as mergespecfile(5) tells"};
    const bool isOfProgram = GetFolder(file) == GetDataFilesDir();
    const FallbackCommandMap tools = PopulateFallbacks(file);
    if (tools.empty())
        return {Health::Problem, file + " names no merge tool",
                "write one into it, as mergespecfile(5) tells"};
    const std::string missing = MissingTools(tools);
    if (!isOfProgram && !missing.empty())
        return {Health::Problem, file + " names tools that are not there: " + missing,
                "install them, or take their lines out"};
    if (!HasTool(tools))
        return {Health::Note, "none of the merge tools is there that " + file + " knows",
                "install one of them, such as kdiff3, or settle conflicts with \"ovrin settle\""};
    return {Health::Fine, file + " names tools that are there"};
}

Diagnosis LookAtTemporaryFiles(Patient&) {
    const std::vector<std::string> files = ForgottenTemporaryFiles();
    if (files.empty()) return {Health::Fine, "no merge left anything in the temporary directory"};
    return {Health::Problem,
            "merges left " + std::to_string(files.size()) + " files in the temporary directory, the first " +
                files.front(),
            "ovrin doctor --fix removes them", [files] { return RemoveAll(files); }};
}

} // namespace ovrin
