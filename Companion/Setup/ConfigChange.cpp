#include "Setup/ConfigChange.h"

#include "Setup/MarkedBlock.h"
#include "Words/Failure.h"
#include "Words/WriteFailure.h"

#include "Destination.h"
#include "FileUtils.h"

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <optional>
#include <set>
#include <sstream>
#include <system_error>
#include <unistd.h>
#include <utility>
#include <vector>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

using Kind = ConfigChange::Kind;

constexpr std::string_view kShellLine = "#!/bin/sh\n";

[[noreturn]] void FailWith(const std::string& what, int error) {
    throw Failure(what + ": " + std::system_category().message(error));
}

/// The text of the file; nothing where there is none.
std::optional<std::string> TextOf(const std::string& path) {
    std::string text;
    errno = 0;
    if (ReadWholeFile(path, text) == ReadResult::Complete) return text;
    if (errno == ENOENT) return {};
    FailWith("Cannot read " + path, errno);
}

FirstMark MarkOf(FileKind kind) {
    return kind == FileKind::GitConfig ? FirstMark::BehindTheFirstLine : FirstMark::OnItsOwnLine;
}

unsigned MissingFolders(const fs::path& file) {
    unsigned count = 0;
    std::error_code error;
    for (fs::path folder = file.parent_path(); folder.has_relative_path() && !fs::exists(folder, error);
         folder = folder.parent_path())
        ++count;
    return count;
}

/// Whether a line such as "#!/usr/bin/env bash" names a shell that takes our lines.
bool NamesAShell(const std::string& line) {
    std::istringstream words(line.substr(std::min<std::size_t>(line.size(), 2)));
    std::string program, word;
    words >> program;
    if (fs::path(program).filename() == "env")
        while (words >> word && (word.starts_with('-') || word.find('=') != std::string::npos)) {
        }
    else
        word = program;
    static const std::set<std::string> kShells = {"sh", "bash", "dash", "ksh", "mksh", "zsh", "ash"};
    return line.starts_with("#!") && line.find('\r') == std::string::npos &&
           kShells.contains(fs::path(word).filename());
}

/// Behind the line that names the shell: a script may end anywhere. Throws Failure where the lines would not
/// be run.
std::size_t PlaceInScript(const std::string& path, const std::string& text) {
    const std::size_t end = text.find('\n');
    if (!NamesAShell(text.substr(0, end)))
        throw Failure(path +
                      " is somebody's hook and no shell script: nothing is added to it. Let it run \"" +
                      "ovrin status --guard\" itself, and fail where that fails");
    if (access(path.c_str(), X_OK) != 0)
        throw Failure(
            path + " is not executable, so that git passes it over: nothing is added to it. \"chmod +x\" " +
            "switches it on; set up again then");
    return end == std::string::npos ? text.size() : end + 1;
}

/// The lines of a block that the set-up didn't write, with the headers of their sections.
std::string ForeignLines(const std::string& found, const std::string& written) {
    const auto linesOf = [](const std::string& text) {
        std::vector<std::string> lines;
        std::istringstream stream(text);
        for (std::string line; std::getline(stream, line);) {
            if (line.ends_with('\r')) line.pop_back();
            lines.push_back(line + '\n');
        }
        return lines;
    };
    const std::vector<std::string> ours = linesOf(written);
    std::string foreign, header;
    for (const std::string& line : linesOf(found)) {
        const bool isOurs = std::ranges::find(ours, line) != ours.end();
        if (line.starts_with('[')) header = isOurs ? line : "";
        if (isOurs) continue;
        foreign += std::exchange(header, "") + line;
    }
    return foreign;
}

ConfigChange Planned(const Configuration& configuration, Kind kind, const std::string& before,
                     const std::string& after) {
    if (configuration.check) configuration.check(before, after);
    return {.kind = kind,
            .path = configuration.path,
            .lines = configuration.lines,
            .kept = {},
            .before = before,
            .after = after};
}

ConfigChange PlanNewFile(const Configuration& configuration) {
    const unsigned folders = MissingFolders(configuration.path);
    const std::string text(configuration.kind == FileKind::Script ? kShellLine : std::string_view());
    ConfigChange change = Planned(
        configuration, Kind::Make, {},
        AddBlock(text, text.size(), configuration.lines, {true, folders}, MarkOf(configuration.kind)));
    change.folders = folders;
    return change;
}

/// What somebody wrote among our lines, which must be told from them. Throws Failure where it can't be.
std::string ForeignLines(const Configuration& configuration, const MarkedBlock& block) {
    if (block.isUnchanged) return {};
    if (configuration.kind == FileKind::Script)
        throw Failure("somebody changed what setup wrote into " + configuration.path +
                      ": take it out by hand, from \"# >>> ovrin setup\" to \"# <<< ovrin setup\"");
    return ForeignLines(block.lines, configuration.lines);
}

void MakeFolders(const ConfigChange& change) {
    std::error_code error;
    fs::create_directories(fs::path(change.path).parent_path(), error);
    if (error) FailWith("Cannot make the folder of " + change.path, error.value());
}

void RemoveEmptyFolders(const fs::path& file, unsigned count) {
    fs::path folder = file.parent_path();
    for (; count > 0 && rmdir(folder.c_str()) == 0; --count) folder = folder.parent_path();
}

void Delete(const ConfigChange& change) {
    std::error_code error;
    const fs::path place = fs::canonical(change.path, error); // a link to it was there before
    if (error || !fs::remove(place, error)) FailWith("Cannot remove " + change.path, error.value());
    RemoveEmptyFolders(place, change.folders);
}

void Write(const ConfigChange& change) {
    if (change.folders > 0) MakeFolders(change);
    const int error =
        Deliver(change.path, {change.after.size(), [&](OutputStream& stream) { stream << change.after; }});
    if (error == 0) return;
    if (change.folders > 0) RemoveEmptyFolders(change.path, change.folders);
    throw Failure("Cannot write " + change.path + ": " + WhyNotWritten(error));
}

} // namespace

ConfigChange PlanLines(const Configuration& configuration) {
    const auto text = TextOf(configuration.path);
    if (!text) return PlanNewFile(configuration);
    const FirstMark mark = MarkOf(configuration.kind);
    const auto block = FindBlock(*text, configuration.path);
    if (!block) {
        const bool isScript = configuration.kind == FileKind::Script;
        const std::size_t place = isScript ? PlaceInScript(configuration.path, *text) : text->size();
        return Planned(configuration, Kind::Add, *text,
                       AddBlock(*text, place, configuration.lines, {}, mark));
    }
    const std::string foreign = ForeignLines(configuration, *block);
    std::string after = ReplaceBlock(*text, *block, configuration.lines, mark);
    after.insert(block->begin, foreign);
    if (after == *text) return {.kind = Kind::None, .path = configuration.path};
    ConfigChange change = Planned(configuration, Kind::Replace, *text, after);
    change.kept = foreign;
    return change;
}

ConfigChange PlanRemoval(const Configuration& configuration) {
    const auto text = TextOf(configuration.path);
    const auto block = text ? FindBlock(*text, configuration.path) : std::nullopt;
    if (!block) return {.kind = Kind::None, .path = configuration.path};
    const std::string foreign = ForeignLines(configuration, *block);
    const std::string after = RemoveBlock(*text, *block, foreign);
    const bool isRest = configuration.kind == FileKind::Script ? after == kShellLine : after.empty();
    ConfigChange change =
        Planned(configuration, block->origin.madeFile && isRest ? Kind::Delete : Kind::Remove, *text, after);
    change.lines = block->lines;
    change.kept = foreign;
    change.folders = change.kind == Kind::Delete ? block->origin.madeFolders : 0;
    return change;
}

void CarryOut(const ConfigChange& change) {
    if (change.kind == Kind::None) return;
    if (TextOf(change.path).value_or("") != change.before)
        throw Failure(change.path + " was changed by somebody else at this moment: nothing is written to it");
    if (change.kind == Kind::Delete)
        Delete(change);
    else
        Write(change);
    if (change.kind == Kind::Make && change.after.starts_with(kShellLine))
        fs::permissions(change.path, fs::perms::owner_exec | fs::perms::group_exec | fs::perms::others_exec,
                        fs::perm_options::add);
}

} // namespace ovrin
