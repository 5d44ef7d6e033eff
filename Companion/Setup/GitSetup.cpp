#include "Setup/GitSetup.h"

#include "Setup/GitPlaces.h"
#include "Setup/MarkedBlock.h"
#include "Words/Failure.h"

#include "FileUtils.h"

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <sstream>
#include <string_view>
#include <vector>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

constexpr std::string_view kPatterns[] = {"*.ovrin", "*.prefab", "*.meta"};
constexpr const char* kNames[] = {"merge.ovrin.", "diff.ovrin.", "difftool.ovrin.", "mergetool.ovrin.",
                                  "mergetool.ovrin-external."};

/// A value as a configuration of git holds it.
std::string ConfigValue(const std::string& value) {
    std::string text = "\"";
    for (const char character : value) {
        if (character == '"' || character == '\\') text += '\\';
        text += character;
    }
    text += '"';
    const bool isPlain = value.find_first_of("\"\\#;'") == std::string::npos;
    return isPlain ? value : text;
}

/// git puts something in place of each "%" and the letter behind it.
std::string ForDriver(const std::string& call) {
    std::string text;
    for (const char character : call) text += character == '%' ? "%%" : std::string(1, character);
    return text;
}

/// In a criss-cross history git merges several bases into one first. That one must be readable, without
/// conflict markers, and its conflicts are nobody's: "binary" takes a version as it is.
std::string ConfigLines(const ProgramCall& program) {
    const std::string call = program.ForShell();
    const auto line = [](const char* name, const std::string& value) {
        return '\t' + std::string(name) + " = " + ConfigValue(value) + '\n';
    };
    return "[merge \"ovrin\"]\n" + line("name", "structural merge of scenes") +
           line("driver", ForDriver(call) + " merge --base-label %S --our-label %X --their-label %Y"
                                            " -- %O %A %B %A %P") +
           line("recursive", "binary") + "[diff \"ovrin\"]\n" +
           line("command", call + " diff --external --") + "[difftool \"ovrin\"]\n" +
           line("cmd", call + " diff -- \"$LOCAL\" \"$REMOTE\"") + "[mergetool \"ovrin-external\"]\n" +
           line("cmd", call + " settle --with-tool -- \"$BASE\" \"$LOCAL\" \"$REMOTE\" \"$MERGED\"") +
           line("trustExitCode", "true") + "[mergetool \"ovrin\"]\n" +
           line("cmd", call + " settle -- \"$MERGED\"") + line("trustExitCode", "true");
}

struct GuardHook {
    const char* name;
    const char* comment;
    const char* command;
};

/// A rebase that goes on commits without the first hook, and in each of its two forms with another one.
constexpr GuardHook kGuardHooks[] = {
    {"pre-commit", "# Stops a commit that holds unsettled scenes; \"git commit --no-verify\" passes it by.\n",
     " status --guard"},
    {"prepare-commit-msg", "# Stops \"git rebase --continue\" where scenes are unsettled.\n",
     " status --guard --in-rebase"},
    {"pre-applypatch",
     "# Stops \"git am --continue\", and a rebase by patches, where scenes are unsettled.\n",
     " status --guard --in-rebase"},
};

/// A machine without the program must not make commits impossible.
std::string GuardLines(const ProgramCall& program, const GuardHook& hook) {
    const std::string call = program.ForShell();
    return std::string(hook.comment) + "if command -v " + call + " >/dev/null; then\n    " + call +
           hook.command +
           " || exit 1\nelse\n"
           "    echo 'ovrin is not installed here: nothing keeps unsettled scenes from this commit' "
           ">&2\nfi\n";
}

bool IsOurs(const std::string& entry) {
    return std::ranges::any_of(kNames, [&](const char* name) { return entry.starts_with(name); });
}

std::vector<std::string> ForeignEntries(const std::string& text) {
    std::vector<std::string> entries = EntriesOfGitConfig(text);
    std::erase_if(entries, IsOurs);
    return entries;
}

/// A file whose last line goes on behind its end, or that git can't read at all, must not take our lines.
void CheckConfig(const std::string& path, const std::string& before, const std::string& after) {
    if (ForeignEntries(before) != ForeignEntries(after))
        throw Failure("git would read other lines of " + path +
                      " differently with those of setup: look at its last " + "line");
}

Configuration ConfigOf(const std::string& path, const ProgramCall& program) {
    return {
        "git", path, ConfigLines(program), FileKind::GitConfig,
        [path](const std::string& before, const std::string& after) { CheckConfig(path, before, after); }};
}

Configuration AttributesOf(const std::string& path) {
    return {"git", path, AttributeLines(), FileKind::Lines, {}};
}

std::string TextWithoutBlock(const std::string& path) {
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete) return {};
    const auto block = FindBlock(text, path);
    return block ? RemoveBlock(text, *block) : text;
}

/// Lines of somebody else's that say something about scenes, and come to nothing by ours.
void NoticeOthers(const std::string& config, const std::string& attributes, SystemSetup& setup) {
    for (const std::string& entry : EntriesOfGitConfig(TextWithoutBlock(config)))
        if (entry.starts_with("merge.ovrin.driver\n"))
            setup.notices.push_back(config + " has another driver = " + entry.substr(entry.find('\n') + 1) +
                                    "; that of setup wins if it stands behind it");
    std::istringstream lines(TextWithoutBlock(attributes));
    for (std::string line; std::getline(lines, line);) {
        const std::string pattern = line.substr(0, line.find_first_of(" \t"));
        const bool isAboutScenes = std::ranges::find(kPatterns, pattern) != std::end(kPatterns);
        if (isAboutScenes && line.find(" merge=ovrin") == std::string::npos)
            setup.notices.push_back((attributes + " also says \"").append(line) +
                                    "\"; the lines of setup win");
    }
}

void AddGuard(const ProgramCall& program, SystemSetup& setup) {
    const fs::path folder = GitHooks();
    if (folder.empty()) return;
    std::error_code error;
    if (fs::exists(folder, error) && !fs::is_directory(folder, error)) {
        setup.notices.push_back("core.hooksPath leads to " + folder.string() +
                                ", which is no folder: hooks are switched off here, and the guard with them");
        return;
    }
    for (const GuardHook& hook : kGuardHooks)
        setup.files.push_back(
            {"git", (folder / hook.name).string(), GuardLines(program, hook), FileKind::Script, {}});
    if (folder != fs::path(GitConfigs(Scope::Local).front()).parent_path() / "hooks")
        setup.notices.push_back(folder.string() +
                                " is where core.hooksPath leads: it may be committed, or serve other "
                                "repositories as well");
}

} // namespace

std::string AttributeLines() {
    std::string lines;
    for (const std::string_view pattern : kPatterns)
        lines += std::string(pattern) + " -text merge=ovrin diff=ovrin\n";
    return lines;
}

SystemSetup SetupOfGit(Scope scope, const ProgramCall& program) {
    const std::string config = GitConfigs(scope).front(), attributes = GitAttributes(scope).front();
    SystemSetup setup{.system = "git",
                      .files = {ConfigOf(config, program), AttributesOf(attributes)},
                      .notices = {},
                      .refused = {}};
    NoticeOthers(config, attributes, setup);
    if (scope == Scope::Global) return setup;
    AddGuard(program, setup);
    setup.notices.push_back(
        "this is for this clone. For colleagues, commit these lines in .gitattributes, and "
        "let each run \"ovrin setup\" once:\n" +
        AttributeLines());
    return setup;
}

SystemSetup RemovalFromGit(Scope scope, const ProgramCall& program) {
    SystemSetup setup{.system = "git", .files = {}, .notices = {}, .refused = {}};
    for (const std::string& path : GitAttributes(scope)) setup.files.push_back(AttributesOf(path));
    for (const std::string& path : GitConfigs(scope)) setup.files.push_back(ConfigOf(path, program));
    if (scope == Scope::Local) AddGuard(program, setup);
    std::ranges::reverse(setup.files); // the first of the hooks may have made their folder
    return setup;
}

} // namespace ovrin
