#include "Doctor/TemporaryFiles.h"

#include "FileUtils.h"

#include <algorithm>
#include <ctime>
#include <filesystem>
#include <fnmatch.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

constexpr std::time_t kAge = 3600; // seconds

std::string NamePattern() {
    std::string pattern = kTempFileTemplate;
    std::ranges::replace(pattern, 'X', '?');
    return pattern;
}

bool IsOldAndOurs(const std::string& path) {
    struct stat status;
    return lstat(path.c_str(), &status) == 0 && S_ISREG(status.st_mode) && status.st_uid == getuid() &&
           std::time(nullptr) - status.st_mtime > kAge;
}

/// Entries of a folder; none where it can't be read, as with processes of others, or such as just ended.
std::vector<fs::path> EntriesOf(const fs::path& folder) {
    std::vector<fs::path> entries;
    std::error_code error;
    for (fs::directory_iterator at(folder, error), end; !error && at != end; at.increment(error))
        entries.push_back(at->path());
    return entries;
}

/// The command line of a process and the names of its open files.
std::string HoldingsOf(const fs::path& process) {
    std::string holdings;
    ReadWholeFile((process / "cmdline").string(), holdings);
    for (const fs::path& file : EntriesOf(process / "fd")) {
        std::error_code error;
        holdings += '\0' + fs::read_symlink(file, error).string();
    }
    return holdings;
}

} // namespace

std::vector<std::string> ForgottenTemporaryFiles() {
    const std::string pattern = NamePattern();
    std::vector<std::string> files;
    for (const fs::path& file : EntriesOf(fs::path(kTempFileTemplate).parent_path()))
        if (fnmatch(pattern.c_str(), file.c_str(), FNM_PATHNAME) == 0 && IsOldAndOurs(file))
            files.push_back(file);
    std::ranges::sort(files);
    if (files.empty()) return files;
    for (const fs::path& process : EntriesOf("/proc")) {
        if (!std::isdigit(static_cast<unsigned char>(process.filename().string().front()))) continue;
        const std::string holdings = HoldingsOf(process);
        std::erase_if(files,
                      [&](const std::string& file) { return holdings.find(file) != std::string::npos; });
    }
    return files;
}

} // namespace ovrin
