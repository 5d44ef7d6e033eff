#include "FilePlace.h"

#include "FileUtils.h"

#include <cerrno>
#include <climits>
#include <linux/magic.h> // PROC_SUPER_MAGIC
#include <sys/vfs.h>
#include <unistd.h>

namespace {

/// Whether a link in this folder leads to an open file itself: it reads as a name that the file may have had.
bool IsFolderOfOpenFiles(const std::string& folder) {
    struct statfs system;
    return statfs(folder.c_str(), &system) == 0 && system.f_type == PROC_SUPER_MAGIC;
}

} // namespace

int FollowLinks(std::string& path) {
    constexpr int kMostLinks = 40; // as the system has it
    char target[PATH_MAX];
    for (int i = 0; i < kMostLinks; ++i) {
        const ssize_t length = readlink(path.c_str(), target, sizeof(target));
        if (length < 0) return errno == EINVAL || errno == ENOENT ? 0 : errno;
        if (IsFolderOfOpenFiles(GetFolder(path))) return EPERM;
        const std::string link(target, static_cast<std::size_t>(length));
        path = link.starts_with('/') ? std::string() : GetFolder(path);
        path += link;
    }
    return ELOOP;
}
