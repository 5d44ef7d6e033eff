#include "FileUtils.h"

#include "ErrMsg.h"

#include "Values/Arena.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstdlib>
#include <fcntl.h>
#include <sys/auxv.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

std::stringstream errs;

/// The read size where a file does not tell its own.
constexpr std::size_t kChunkSize = std::size_t{64} * 1024;

class FileDescriptor {
public:
    explicit FileDescriptor(int descriptor) : m_Descriptor(descriptor) {}
    FileDescriptor(const FileDescriptor&) = delete;
    FileDescriptor& operator=(const FileDescriptor&) = delete;
    ~FileDescriptor() {
        if (m_Descriptor >= 0) close(m_Descriptor);
    }
    int Get() const { return m_Descriptor; }

private:
    const int m_Descriptor;
};

/// Never 0: one byte beyond the size lets the end be seen without growing the buffer.
std::size_t ExpectedSize(int descriptor) {
    struct stat status;
    if (fstat(descriptor, &status) != 0 || status.st_size <= 0) return kChunkSize;
    return static_cast<std::size_t>(status.st_size) + 1;
}

/// Fills `buffer` from the file; -1 if it can't be read. Less than `size` means that the end was reached.
ssize_t ReadFully(int descriptor, char* buffer, std::size_t size) {
    std::size_t length = 0;
    while (length < size) {
        const ssize_t count = read(descriptor, buffer + length, size - length);
        if (count < 0 && errno == EINTR) continue;
        if (count < 0) return -1;
        if (count == 0) break;
        length += static_cast<std::size_t>(count);
    }
    return static_cast<ssize_t>(length);
}

bool ReadToEnd(int descriptor, std::string& bytes) {
    bool isComplete = true;
    bytes.clear();
    for (std::size_t capacity = ExpectedSize(descriptor); bytes.size() < capacity; capacity *= 2) {
        const std::size_t before = bytes.size();
        bytes.resize_and_overwrite(capacity, [&](char* buffer, std::size_t) {
            ovrin_yaml::AdviseHugePages(buffer + before, capacity - before);
            const ssize_t count = ReadFully(descriptor, buffer + before, capacity - before);
            isComplete = count >= 0;
            return before + static_cast<std::size_t>(std::max<ssize_t>(count, 0));
        });
        if (!isComplete || bytes.size() < capacity) break;
    }
    return isComplete;
}

/// Empty if it can't be found. Without /proc there is the name that the program was started by.
std::string ExecutablePath() {
    char buffer[PATH_MAX];
    const char* started = reinterpret_cast<const char*>(getauxval(AT_EXECFN));
    return realpath("/proc/self/exe", buffer) || (started && realpath(started, buffer)) ? buffer : "";
}

} // namespace

std::string GetUserHomeDir() {
    const char* home = std::getenv("HOME");
    return home ? home : "~";
}

std::string OvrinToNativePath(const std::string& path) {
    return path;
}

std::string CreateTempFile() {
    std::string path = kTempFileTemplate;
    const int descriptor = mkstemp(path.data());
    if (descriptor < 0) return {};
    close(descriptor);
    return path;
}

bool FileExists(const char* path) {
    return access(path, R_OK) == 0;
}

bool IsMissing(const std::string& path) {
    return access(path.c_str(), F_OK) != 0 && errno == ENOENT;
}

bool IsFileEmpty(const std::string& path) {
    struct stat status;
    return stat(path.c_str(), &status) == 0 && status.st_size == 0;
}

std::string GetFileExtension(const std::string& path) {
    const std::size_t dot = path.rfind('.');
    return dot == std::string::npos ? std::string() : path.substr(dot + 1);
}

std::string GetFolder(const std::string& path) {
    const std::size_t separator = path.rfind('/');
    return separator == std::string::npos ? "./" : path.substr(0, separator + 1);
}

std::string GetDataFilesDir() {
    const std::string path = ExecutablePath();
    const std::size_t separator = path.find_last_of("/\\");
    if (separator != std::string::npos) return path.substr(0, separator + 1);
    errs << (path.empty() ? "Couldn't locate dir of factory merge spec file\n" : "My path is invalid\n");
    ErrMsg(errs);
    return {};
}

std::size_t FileSize(const std::string& path) {
    struct stat status;
    return stat(OvrinToNativePath(path).c_str(), &status) == 0 ? static_cast<std::size_t>(status.st_size) : 0;
}

ReadResult ReadWholeFile(const std::string& path, std::string& bytes) {
    const FileDescriptor file(open(OvrinToNativePath(path).c_str(), O_RDONLY | O_CLOEXEC));
    if (file.Get() < 0) return ReadResult::CannotOpen;
    return ReadToEnd(file.Get(), bytes) ? ReadResult::Complete : ReadResult::CannotRead;
}
