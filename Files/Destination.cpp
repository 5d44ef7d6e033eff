#include "Destination.h"

#include "Descriptor.h"
#include "DestinationDraft.h"
#include "FileCopier.h"
#include "FilePlace.h"
#include "FileUtils.h"
#include "NewFile.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <initializer_list>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace {

/// Who holds the other end of a standard stream knows the file and not its name. Where a stream was closed,
/// its number may be that of `file`, which says nothing.
bool IsStandardStream(const Descriptor& file, const struct stat& status) {
    struct stat stream;
    return std::ranges::any_of(std::initializer_list<int>{STDOUT_FILENO, STDERR_FILENO}, [&](int number) {
        return number != file.Get() && fstat(number, &stream) == 0 && IsSameFile(status, stream);
    });
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

/// What is written anew may need the room on the disk that the draft takes.
void GiveUpDraft(const Content& content) {
    if (content.draft) content.draft->GiveUp();
}

/// Puts a whole new file at `place`. `old` is what stands there, null for nothing. The file has no name in
/// the folder while it is being written, if that can be had.
int PutNewFile(const std::string& place, const Descriptor* old, const Content& content) {
    if (old && content.draft && content.draft->TakePlace(place, *old, content.durability)) return 0;
    GiveUpDraft(content);
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
    GiveUpDraft(content);
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

int OutputResultToDestination(const std::string& source, const std::string& dest, DestinationDraft* draft) {
    const Descriptor file = OpenFile(OvrinToNativePath(source).c_str(), O_RDONLY);
    struct stat status;
    if (!file.IsOpen() || fstat(file.Get(), &status) != 0) return errno;
    const auto copy = [&](OutputStream& stream) { FileCopier(file).Copy(0, UINT64_MAX, stream); };
    Content content{static_cast<std::uint64_t>(status.st_size), copy};
    if (draft && draft->Complete(file)) content.draft = draft;
    return Deliver(dest, content);
}
