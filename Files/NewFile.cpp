#include "NewFile.h"

#include "FileUtils.h"

#include <cerrno>
#include <cstdio> // rename
#include <fcntl.h>
#include <linux/limits.h> // XATTR_SIZE_MAX
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace {

/// The way to a file without a name.
std::string LinkOf(const Descriptor& file) {
    return "/proc/self/fd/" + std::to_string(file.Get());
}

bool HasNoAccessList() {
    return errno == ENODATA || errno == EOPNOTSUPP || errno == ENOSYS;
}

/// Makes the access list of `to` that of `from`. None is one too: the folder may have given another to a new
/// file. Beside a list the mode tells less than who may read. Returns errno or 0.
int CopyAccessList(const Descriptor& from, const Descriptor& to) {
    constexpr const char* kName = "system.posix_acl_access";
    char list[XATTR_SIZE_MAX];
    const ssize_t size = fgetxattr(from.Get(), kName, list, sizeof(list));
    if (size < 0 && !HasNoAccessList()) return errno;
    if (size >= 0)
        return fsetxattr(to.Get(), kName, list, static_cast<std::size_t>(size), 0) == 0 ? 0 : errno;
    return fremovexattr(to.Get(), kName) == 0 || HasNoAccessList() ? 0 : errno;
}

} // namespace

NewFile::~NewFile() {
    if (!m_Name.empty()) unlink(m_Name.c_str());
}

/// Tries hidden names until `take` succeeds. Another process of this number, on another machine or in the
/// past, may have left some behind.
template <class Take> int NewFile::FindName(const Take& take) {
    constexpr int kAttempts = 100;
    const std::string start = GetFolder(m_Place) + ".ovrinmerge-" + std::to_string(getpid()) + '-';
    for (int attempt = 0; attempt < kAttempts; ++attempt) {
        const std::string name = start + std::to_string(attempt);
        if (take(name.c_str())) {
            m_Name = name;
            return 0;
        }
        if (errno != EEXIST) return errno;
    }
    return EEXIST;
}

/// The link serves TakeName later: it is missing where /proc is.
int NewFile::OpenUnnamed(mode_t mode) {
    m_File = OpenFile(GetFolder(m_Place).c_str(), O_TMPFILE | O_WRONLY, mode);
    return m_File.IsOpen() && access(LinkOf(m_File).c_str(), F_OK) == 0 ? 0 : errno;
}

int NewFile::OpenNamed(mode_t mode) {
    return FindName([&](const char* name) {
        m_File = OpenFile(name, O_WRONLY | O_CREAT | O_EXCL, mode);
        return m_File.IsOpen();
    });
}

/// The owner comes first: who may read is opened last.
int NewFile::Resemble(const Descriptor& other) {
    struct stat status;
    if (fstat(other.Get(), &status) != 0) return errno;
    if (fchown(m_File.Get(), status.st_uid, status.st_gid) != 0 &&
        fchown(m_File.Get(), -1, status.st_gid) != 0 && errno != EPERM && errno != EINVAL)
        return errno;
    if (const int error = CopyAccessList(other, m_File)) return error;
    return fchmod(m_File.Get(), status.st_mode & 0777) == 0 ? 0 : errno;
}

int NewFile::Fill(const OutputWriter& write, Durability durability) {
    OutputStream stream(m_File.Get());
    write(stream);
    const int error = stream.Finish();
    return error ? error : Secure(durability);
}

int NewFile::Secure(Durability durability) const {
    return durability == Durability::Synced ? Sync(m_File.Get()) : 0;
}

int NewFile::TakeName() {
    const std::string link = LinkOf(m_File);
    return FindName([&](const char* name) {
        return linkat(AT_FDCWD, link.c_str(), AT_FDCWD, name, AT_SYMLINK_FOLLOW) == 0;
    });
}

/// File systems such as ext4 write a file to the disk as soon as its name replaces another, so that a failure
/// of the machine finds one of them. Whoever removes the file waits for that, longer than the whole merge of
/// a scene takes. A file that changes places with the other one isn't written.
int NewFile::TakePlace(Durability durability) {
    if (const int error = m_File.Close()) return error;
    if (durability == Durability::Passing && ChangePlaces() == 0) return RemoveOther();
    if (rename(m_Name.c_str(), m_Place.c_str()) != 0) return errno;
    m_Name.clear();
    return 0;
}

int NewFile::ChangePlaces() {
    return renameat2(AT_FDCWD, m_Name.c_str(), AT_FDCWD, m_Place.c_str(), RENAME_EXCHANGE) == 0 ? 0 : errno;
}

/// The old file, which has the hidden name now. Where that can't be done all is put back.
int NewFile::RemoveOther() {
    if (unlink(m_Name.c_str()) != 0) {
        const int error = errno;
        ChangePlaces();
        return error;
    }
    m_Name.clear();
    return 0;
}
