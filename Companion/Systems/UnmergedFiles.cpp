#include "Systems/UnmergedFiles.h"

#include "Systems/Git.h"
#include "Systems/Repository.h"
#include "Systems/WorkingFiles.h"

#include <algorithm>
#include <sstream>

namespace ovrin {

namespace {

std::vector<std::string> OfGit(const Repository& repository) {
    std::vector<std::string> paths;
    for (GitEntry& entry : Git(repository).WithOwnIndex().Unmerged()) paths.push_back(std::move(entry.path));
    return paths;
}

std::vector<std::string> OfMercurial(const Repository& repository) {
    const std::string listed = OutputOf({"hg", "resolve", "--list", "--template", "{mergestatus}{path}\\0"},
                                        PlainSetting(repository));
    std::vector<std::string> paths;
    std::istringstream entries(listed);
    for (std::string entry; std::getline(entries, entry, '\0');)
        if (entry.starts_with('U')) paths.push_back(entry.substr(1));
    return paths;
}

std::vector<std::string> OfSubversion(const Repository& repository) {
    constexpr std::size_t kColumns = 8; // in front of the path, which has no line feed here
    std::istringstream lines(OutputOf({"svn", "status", "--quiet"}, PlainSetting(repository)));
    std::vector<std::string> paths;
    for (std::string line; std::getline(lines, line);)
        if (line.starts_with('C') && line.size() > kColumns) paths.push_back(line.substr(kColumns));
    return paths;
}

} // namespace

std::vector<std::string> UnmergedFiles(const Repository& repository) {
    std::vector<std::string> paths = repository.kind == SystemKind::Git         ? OfGit(repository)
                                     : repository.kind == SystemKind::Mercurial ? OfMercurial(repository)
                                                                                : OfSubversion(repository);
    std::ranges::sort(paths);
    paths.erase(std::unique(paths.begin(), paths.end()), paths.end());
    return paths;
}

void MarkMerged(const Repository& repository, const std::vector<std::string>& paths) {
    if (repository.kind == SystemKind::Git) return Git(repository).WithOwnIndex().Add(paths);
    const bool isMercurial = repository.kind == SystemKind::Mercurial;
    CommandWords command = isMercurial
                               ? CommandWords{"hg", "resolve", "--mark", "--quiet", "--"}
                               : CommandWords{"svn", "resolve", "--quiet", "--accept", "working", "--"};
    // Both would read more into a bare path: a pattern, and a revision behind an "@".
    for (const std::string& path : paths) command.push_back(isMercurial ? "path:" + path : path + "@");
    OutputOf(command, PlainSetting(repository));
}

} // namespace ovrin
