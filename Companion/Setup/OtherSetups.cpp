#include "Setup/OtherSetups.h"

#include "Setup/MarkedBlock.h"
#include "Setup/UserFolders.h"
#include "Systems/Process.h"
#include "Words/Failure.h"

#include "FileUtils.h"

#include <algorithm>
#include <sstream>
#include <unistd.h>
#include <utility>
#include <vector>

namespace ovrin {

namespace {

/// The files that Mercurial reads, the one first that it opens for changes.
std::vector<std::string> MercurialConfigs(Scope scope) {
    if (scope == Scope::Local) {
        return {WithoutLineEnd(OutputOf({"hg", "root"})) + "/.hg/hgrc"};
    }
    std::string ofHome = HomeFor("Mercurial") + "/.hgrc";
    std::string ofSettings = SettingsFolderFor("Mercurial") + "/hg/hgrc";
    if (!FileExists(ofHome.c_str()) && FileExists(ofSettings.c_str())) std::swap(ofHome, ofSettings);
    return {ofHome, ofSettings};
}

/// The program is called through env: Mercurial merges by lines where it can't find a tool, but takes a
/// failing one for a conflict. "premerge" would be a merge by lines, too. "disabled" keeps the tool from
/// being chosen for files that no pattern gives to it.
Configuration MercurialConfig(const std::string& path, const ProgramCall& program) {
    const std::string lines = "[merge-patterns]\n"
                              "**.ovrin = ovrin\n"
                              "**.prefab = ovrin\n"
                              "**.meta = ovrin\n"
                              "[merge-tools]\n"
                              "ovrin.executable = env\n"
                              "ovrin.args = " +
                              program.ForShell() +
                              " merge -- $base $local $other $output $output\n"
                              "ovrin.premerge = False\n"
                              "ovrin.disabled = True\n";
    return {"hg", path, lines, FileKind::Sections, {}};
}

Configuration SubversionConfig(const ProgramCall& program) {
    return {"svn",
            HomeFor("Subversion") + "/.subversion/config",
            "[helpers]\nmerge-tool-cmd = " + program.ForSubversion() + "\n",
            FileKind::Sections,
            {}};
}

/// The tool that somebody else's lines name.
std::string OthersTool(const std::string& path) {
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete) return {};
    const auto block = FindBlock(text, path);
    return MergeToolOfSubversion(block ? RemoveBlock(text, *block) : text);
}

std::string Trimmed(const std::string& text) {
    constexpr const char* kBlanks = " \t\r";
    const std::size_t begin = text.find_first_not_of(kBlanks);
    return begin == std::string::npos ? "" : text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

std::string InLowerCase(std::string text) {
    std::ranges::transform(text, text.begin(), [](unsigned char letter) { return std::tolower(letter); });
    return text;
}

bool IsThere(const std::string& program) {
    return program.find('/') == std::string::npos ? !FindProgram(program).empty()
                                                  : access(program.c_str(), X_OK) == 0;
}

} // namespace

SystemSetup SetupOfMercurial(Scope scope, const ProgramCall& program) {
    const std::string path = MercurialConfigs(scope).front();
    SystemSetup setup{
        .system = "hg", .files = {MercurialConfig(path, program)}, .notices = {}, .refused = {}};
    for (const char* name : {"HGRCPATH", "HGMERGE"})
        if (!VariableOf(name).empty())
            setup.notices.push_back(std::string(name) + " is set to " + VariableOf(name) +
                                    ", which keeps Mercurial from what stands in " + path);
    return setup;
}

SystemSetup RemovalFromMercurial(Scope scope, const ProgramCall& program) {
    SystemSetup setup{.system = "hg", .files = {}, .notices = {}, .refused = {}};
    for (const std::string& path : MercurialConfigs(scope))
        setup.files.push_back(MercurialConfig(path, program));
    return setup;
}

SystemSetup SetupOfSubversion(const ProgramCall& program) {
    SystemSetup setup = RemovalFromSubversion(program);
    const std::string tool = program.ForSubversion(), path = setup.files.front().path;
    const std::string others = OthersTool(path);
    const bool isThere = IsThere(tool);
    const bool isOfOldSetup = others.ends_with("ovrinmerge-vcs"); // the program's name of earlier versions
    if (!others.empty() && !IsOurToolOfSubversion(others) && !isOfOldSetup)
        setup.refused.push_back(path + " has merge-tool-cmd = " + others +
                                " already, and Subversion knows one tool only. Take that line out and set up "
                                "again" +
                                (isThere ? ", or call " + tool + " from there" : ""));
    if (!isThere)
        setup.refused.push_back(tool +
                                " is not there, which Subversion would call: install the program whole");
    if (!setup.refused.empty()) setup.files.clear();
    if (!VariableOf("SVN_MERGE").empty())
        setup.notices.push_back("SVN_MERGE is set to " + VariableOf("SVN_MERGE") +
                                ", and wins over merge-tool-cmd in " + path);
    return setup;
}

SystemSetup RemovalFromSubversion(const ProgramCall& program) {
    return {.system = "svn", .files = {SubversionConfig(program)}, .notices = {}, .refused = {}};
}

std::string MergeToolOfSubversion(const std::string& text) {
    std::istringstream lines(text);
    std::string tool, section;
    for (std::string line; std::getline(lines, line);) {
        if (line.starts_with('[')) section = InLowerCase(line.substr(1, line.find(']') - 1));
        const std::size_t sign = line.find_first_of("=:");
        if (section != "helpers" || sign == std::string::npos) continue;
        if (InLowerCase(Trimmed(line.substr(0, sign))) == "merge-tool-cmd")
            tool = Trimmed(line.substr(sign + 1));
    }
    return tool;
}

bool IsOurToolOfSubversion(const std::string& tool) {
    return tool.substr(tool.rfind('/') + 1) == "ovrin-svn"; // npos + 1 is 0
}

} // namespace ovrin
