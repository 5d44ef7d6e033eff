#include "Checks/ScenesToCheck.h"

#include "FileUtils.h"
#include "Scenes/SceneFile.h"
#include "Systems/BlobReader.h"
#include "Systems/Git.h"
#include "Systems/Repository.h"
#include "Systems/WorkingFiles.h"
#include "Systems/WorkingPath.h"
#include "Words/Failure.h"

#include <cerrno>
#include <memory>
#include <mutex>
#include <set>
#include <sys/stat.h>
#include <system_error>

namespace ovrin {

namespace {

std::string ReadScene(const std::string& path) {
    std::string bytes;
    errno = 0;
    if (ReadWholeFile(path == "-" ? "/dev/stdin" : path, bytes) == ReadResult::Complete) return bytes;
    throw Failure("Cannot read it: " + std::system_category().message(errno));
}

/// Most of these describe other files, in a form of their own.
bool MayBeOther(const std::string& path) {
    const std::string extension = GetFileExtension(path);
    return extension == "meta" || extension == "MET";
}

bool IsRegularFile(const std::string& path) {
    struct stat status;
    return lstat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode);
}

/// What stands in the working tree of these, in order; links lead to what has a name of its own.
std::vector<SceneToCheck> InWorkingTree(const Repository& repository, const std::vector<std::string>& paths) {
    std::vector<SceneToCheck> scenes;
    for (const std::string& path : paths) {
        const std::string place = repository.top + '/' + path;
        if (IsSceneName(path) && IsRegularFile(place))
            scenes.push_back({path, path, [place] { return ReadScene(place); }, MayBeOther(path)});
    }
    return scenes;
}

/// Blobs from one process of git, for several threads.
class SharedBlobs {
public:
    explicit SharedBlobs(ProcessSetting setting) : m_Reader(std::move(setting)) {}

    std::string Read(const std::string& id) {
        const std::lock_guard lock(m_Lock);
        return m_Reader.Read(id);
    }

private:
    std::mutex m_Lock;
    BlobReader m_Reader;
};

} // namespace

std::vector<SceneToCheck> NamedScenes(const std::vector<std::string>& files, const Repository* repository) {
    const auto pathOf = [&](const std::string& file) -> std::string {
        if (!repository || repository->top.empty() || file == "-") return "";
        try {
            return WorkingPath(*repository, file);
        } catch (const Failure&) {
            return ""; // it lies outside
        }
    };
    std::vector<SceneToCheck> scenes;
    scenes.reserve(files.size());
    for (const std::string& file : files)
        scenes.push_back({file, pathOf(file), [file] { return ReadScene(file); }});
    return scenes;
}

std::vector<SceneToCheck> StagedScenes(const Repository& repository) {
    if (repository.kind != SystemKind::Git)
        throw Failure("Only git has an index to check; \"ovrin check\" alone checks what was changed");
    const Git git(repository);
    const std::vector<std::string> changed = git.DifferingFromHead({}, true);
    const std::set<std::string> isChanged(changed.begin(), changed.end());
    const auto blobs = std::make_shared<SharedBlobs>(git.Setting());
    std::vector<SceneToCheck> scenes;
    for (const GitEntry& entry : git.Entries()) {
        if (!entry.mode.starts_with("100") || !IsSceneName(entry.path) || !isChanged.contains(entry.path))
            continue;
        if (entry.stage == GitEntry::Merged)
            scenes.push_back({entry.path, entry.path, [blobs, id = entry.object] { return blobs->Read(id); },
                              MayBeOther(entry.path)});
        else if (scenes.empty() || scenes.back().path != entry.path)
            scenes.push_back({entry.path, entry.path, nullptr});
    }
    return scenes;
}

std::vector<SceneToCheck> AllScenes(const Repository& repository) {
    return InWorkingTree(repository, TrackedFiles(repository));
}

std::vector<SceneToCheck> ChangedScenes(const Repository& repository) {
    return InWorkingTree(repository, DifferingFiles(repository));
}

} // namespace ovrin
