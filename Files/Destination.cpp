#include "Destination.h"

#include "Descriptor.h"
#include "FileUtils.h"
#include "NewFile.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <fcntl.h>
#include <initializer_list>
#include <linux/magic.h> // PROC_SUPER_MAGIC
#include <memory>
#include <sys/stat.h>
#include <sys/vfs.h>
#include <unistd.h>
#include <utility>

namespace {

bool IsSameFile(const struct stat& left, const struct stat& right) {
    return left.st_dev == right.st_dev && left.st_ino == right.st_ino;
}

/// Who holds the other end of a standard stream knows the file and not its name. Where a stream was closed,
/// its number may be that of `file`, which says nothing.
bool IsStandardStream(const Descriptor& file, const struct stat& status) {
    struct stat stream;
    return std::ranges::any_of(std::initializer_list<int>{STDOUT_FILENO, STDERR_FILENO}, [&](int number) {
        return number != file.Get() && fstat(number, &stream) == 0 && IsSameFile(status, stream);
    });
}

/// Whether a link in this folder leads to an open file itself: it reads as a name that the file may have had.
bool IsFolderOfOpenFiles(const std::string& folder) {
    struct statfs system;
    return statfs(folder.c_str(), &system) == 0 && system.f_type == PROC_SUPER_MAGIC;
}

/// Replaces `path` by what its links lead to, which need not exist. Returns errno or 0; EPERM for what was
/// named by its number as an open file, and must keep its identity.
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

/// Whether the failure says that a file can't be replaced, which isn't to say that it can't be written. The
/// hidden name may be too long where the path isn't.
bool IsRefusal(int error) {
    return error == EACCES || error == EPERM || error == EROFS || error == EBUSY || error == EXDEV ||
           error == ENAMETOOLONG;
}

/// Makes the file, resembling `old` unless that is null.
int Make(NewFile& file, const Descriptor* old, const Content& content) {
    const int error = old ? file.Resemble(*old) : 0;
    return error ? error : file.Fill(content.write, content.durability);
}

/// Puts a whole new file at `place`. `old` is what stands there, null for nothing. The file has no name in
/// the folder while it is being written, if that can be had.
int PutNewFile(const std::string& place, const Descriptor* old, const Content& content) {
    const mode_t mode = old ? 0600 : 0666;
    if (NewFile file(place); file.OpenUnnamed(mode) == 0) {
        if (const int error = Make(file, old, content)) return error;
        if (file.TakeName() == 0) return file.TakePlace(content.durability);
    }
    NewFile file(place);
    if (const int error = file.OpenNamed(mode)) return error;
    if (const int error = Make(file, old, content)) return error;
    return file.TakePlace(content.durability);
}

int Create(const std::string& path, const Content& content) {
    std::string place = path;
    const int error = FollowLinks(place);
    return error ? error : PutNewFile(place, nullptr, content);
}

/// Replaces `file`, which stands at `path`. EPERM where it must keep its identity.
int Replace(const Descriptor& file, const std::string& path, const struct stat& old, const Content& content) {
    if (old.st_nlink != 1 || IsStandardStream(file, old)) return EPERM;
    std::string place = path;
    if (const int error = FollowLinks(place)) return error;
    struct stat found;
    if (lstat(place.c_str(), &found) != 0) return errno;
    return IsSameFile(old, found) ? PutNewFile(place, &file, content) : EPERM;
}

/// Asks for the space where the file system can tell beforehand. Returns errno or 0.
int Reserve(const Descriptor& file, std::uint64_t size) {
    if (size == 0) return 0;
    const auto reserve = [&] {
        return fallocate(file.Get(), FALLOC_FL_KEEP_SIZE, 0, static_cast<off_t>(size));
    };
    return Uninterrupted(reserve) == 0 || errno == EOPNOTSUPP || errno == ENOSYS ? 0 : errno;
}

int WriteFromStart(const Descriptor& file, const Content& content) {
    OutputStream stream(file.Get());
    content.write(stream);
    if (const int error = stream.Finish()) return error;
    const off_t end = lseek(file.Get(), 0, SEEK_CUR);
    if (end < 0) return errno;
    const int error = SetSize(file.Get(), end);
    return error || content.durability != Durability::Synced ? error : Sync(file.Get());
}

/// As far as the system lets it.
void PutBack(const Descriptor& file, const std::string& bytes) {
    if (lseek(file.Get(), 0, SEEK_SET) == 0) WriteFully(file.Get(), bytes.data(), bytes.size());
    SetSize(file.Get(), static_cast<off_t>(bytes.size()));
}

/// Writes through a second descriptor, whose end tells what closing tells while there is still one to put the
/// old bytes back.
int Overwrite(const Descriptor& file, const std::string& path, const Content& content) {
    std::string old;
    errno = 0;
    if (ReadWholeFile(path, old) != ReadResult::Complete) return errno ? errno : EIO;
    Descriptor second = Duplicate(file.Get());
    if (!second.IsOpen()) return errno;
    int error = Reserve(file, content.size);
    if (error == 0) error = WriteFromStart(second, content);
    const int closeError = second.Close();
    if (error == 0) error = closeError;
    if (error != 0) PutBack(file, old);
    return error;
}

void Copy(const Descriptor& source, OutputStream& stream) {
    constexpr std::size_t kPieceSize = std::size_t{1} << 20;
    const auto piece = std::make_unique_for_overwrite<char[]>(kPieceSize);
    off_t position = 0;
    while (stream) {
        const ssize_t count =
            Uninterrupted([&] { return pread(source.Get(), piece.get(), kPieceSize, position); });
        if (count < 0) stream.Fail(errno);
        if (count <= 0) return;
        stream.write(piece.get(), count);
        position += count;
    }
}

} // namespace

int Deliver(const std::string& path, const Content& content) {
    if (path.empty()) return WriteOutput(path, content.write);
    const std::string nativePath = OvrinToNativePath(path);
    Descriptor file = OpenFile(nativePath.c_str(), O_WRONLY);
    if (!file.IsOpen()) return errno == ENOENT ? Create(nativePath, content) : errno;
    struct stat status;
    if (fstat(file.Get(), &status) != 0) return errno;
    if (!S_ISREG(status.st_mode)) return WriteAndClose(std::move(file), content.write);
    const int error = Replace(file, nativePath, status, content);
    return IsRefusal(error) ? Overwrite(file, nativePath, content) : error;
}

int OutputResultToDestination(const std::string& source, const std::string& dest) {
    const Descriptor file = OpenFile(OvrinToNativePath(source).c_str(), O_RDONLY);
    struct stat status;
    if (!file.IsOpen() || fstat(file.Get(), &status) != 0) return errno;
    return Deliver(dest, {static_cast<std::uint64_t>(status.st_size),
                          [&](OutputStream& stream) { Copy(file, stream); }});
}
