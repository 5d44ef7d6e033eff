#include "Systems/Repository.h"

#include "FileUtils.h"

#include <cstdlib>
#include <filesystem>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

bool IsFolder(const fs::path& path) {
    std::error_code error;
    return fs::is_directory(path, error);
}

bool IsThere(const fs::path& path) {
    std::error_code error;
    return fs::exists(path, error);
}

/// The absolute path without links, or the path itself where there is none.
std::string Resolved(const fs::path& path) {
    std::error_code error;
    const fs::path resolved = fs::canonical(path, error);
    return error ? path.string() : resolved.string();
}

/// A linked working tree has a file there, "gitdir: FOLDER".
std::optional<fs::path> GitFolder(const fs::path& dotGit) {
    if (IsFolder(dotGit)) return dotGit;
    constexpr std::string_view kBeginning = "gitdir: ";
    std::string text;
    if (ReadWholeFile(dotGit.string(), text) != ReadResult::Complete || !text.starts_with(kBeginning))
        return {};
    while (text.ends_with('\n') || text.ends_with('\r')) text.pop_back();
    return dotGit.parent_path() / text.substr(kBeginning.size());
}

bool IsBareGit(const fs::path& folder) {
    return IsThere(folder / "HEAD") && IsFolder(folder / "objects") && IsFolder(folder / "refs");
}

std::optional<Repository> RepositoryAt(const fs::path& folder) {
    if (const auto data = GitFolder(folder / ".git"))
        return Repository{SystemKind::Git, Resolved(folder), Resolved(*data)};
    if (IsFolder(folder / ".hg"))
        return Repository{SystemKind::Mercurial, Resolved(folder), Resolved(folder / ".hg")};
    if (IsFolder(folder / ".svn"))
        return Repository{SystemKind::Subversion, Resolved(folder), Resolved(folder / ".svn")};
    if (IsBareGit(folder)) return Repository{SystemKind::Git, "", Resolved(folder)};
    return {};
}

/// Whether a repository of git is one without a working tree, as git itself writes it down.
bool SaysBare(const fs::path& data) {
    std::string config;
    return ReadWholeFile((data / "config").string(), config) == ReadResult::Complete &&
           config.find("\n\tbare = true\n") != std::string::npos;
}

/// As git tells its hooks and drivers.
std::optional<Repository> RepositoryOfEnvironment() {
    const char* data = std::getenv("GIT_DIR");
    if (!data || !IsFolder(data)) return {};
    const char* tree = std::getenv("GIT_WORK_TREE");
    if (!tree && SaysBare(data)) return Repository{SystemKind::Git, "", Resolved(data)};
    return Repository{SystemKind::Git, Resolved(tree ? tree : "."), Resolved(data)};
}

} // namespace

std::optional<Repository> FindRepository(const std::string& folder) {
    if (auto told = RepositoryOfEnvironment()) return told;
    for (fs::path place = Resolved(folder);; place = place.parent_path()) {
        if (auto found = RepositoryAt(place)) return found;
        if (!place.has_relative_path()) return {};
    }
}

} // namespace ovrin
