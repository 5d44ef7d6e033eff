#include "Systems/WorkingFiles.h"

#include "Systems/Git.h"
#include "Systems/Repository.h"

#include <algorithm>
#include <sstream>

namespace ovrin {

namespace {

using Paths = std::vector<std::string>;

Paths InOrder(Paths paths) {
    std::ranges::sort(paths);
    paths.erase(std::unique(paths.begin(), paths.end()), paths.end());
    return paths;
}

Paths AskMercurial(const Repository& repository, const char* states) {
    return ZeroEndedTexts(
        OutputOf({"hg", "status", "--no-status", "--print0", states}, PlainSetting(repository)));
}

/// The paths of a list, which have no line feed here, from those lines that begin with one of these letters.
Paths AskSubversion(const Repository& repository, const CommandWords& command, std::size_t columns,
                    const char* letters) {
    std::istringstream lines(OutputOf(command, PlainSetting(repository)));
    Paths paths;
    for (std::string line; std::getline(lines, line);)
        if (line.find_first_of(letters) == 0 && line.size() > columns) paths.push_back(line.substr(columns));
    return paths;
}

} // namespace

ProcessSetting PlainSetting(const Repository& repository) {
    return {.folder = repository.top, .environment = {{"HGPLAIN", "1"}, {"LC_ALL", "C.UTF-8"}}};
}

std::vector<std::string> TrackedFiles(const Repository& repository) {
    switch (repository.kind) {
    case SystemKind::Git: {
        Paths paths;
        for (GitEntry& entry : Git(repository).Entries()) paths.push_back(std::move(entry.path));
        return InOrder(std::move(paths));
    }
    case SystemKind::Mercurial:
        return InOrder(AskMercurial(repository, "-mac"));
    case SystemKind::Subversion: // "file       PATH"
        return InOrder(
            AskSubversion(repository, {"svn", "info", "--recursive", "--show-item", "kind"}, 11, "f"));
    }
    return {};
}

std::vector<std::string> DifferingFiles(const Repository& repository) {
    switch (repository.kind) {
    case SystemKind::Git: {
        const Git git(repository);
        Paths paths = git.DifferingFromHead({}, false);
        const Paths added = git.Untracked();
        paths.insert(paths.end(), added.begin(), added.end());
        return InOrder(std::move(paths));
    }
    case SystemKind::Mercurial:
        return InOrder(AskMercurial(repository, "-mau"));
    case SystemKind::Subversion: // "M       PATH"
        return InOrder(AskSubversion(repository, {"svn", "status"}, 8, "MARC?~"));
    }
    return {};
}

} // namespace ovrin
