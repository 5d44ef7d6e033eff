#include "DestinationDraft.h"

#include "FileCopier.h"
#include "FilePlace.h"
#include "FileUtils.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>

DestinationDraft::~DestinationDraft() {
    GiveUp();
}

void DestinationDraft::Follow(const std::string& source, std::uint64_t length) noexcept {
    if (!m_File && m_MayBegin && length >= m_Much) {
        m_MayBegin = false;
        try {
            Begin(source);
        } catch (...) {
            // Neither memory nor a thread for what isn't needed.
        }
        if (!m_File) m_Source.Close();
    }
    if (!m_File) return;
    {
        const std::lock_guard lock(m_Lock);
        m_Length = length;
    }
    m_Changed.notify_one();
}

void DestinationDraft::Begin(const std::string& source) {
    m_Place = OvrinToNativePath(m_Dest);
    struct stat status;
    const bool isPlainFile = FollowLinks(m_Place) == 0 && lstat(m_Place.c_str(), &status) == 0 &&
                             S_ISREG(status.st_mode) && status.st_nlink == 1;
    if (!isPlainFile) return;
    auto file = std::make_unique<NewFile>(m_Place);
    m_Source = OpenFile(source.c_str(), O_RDONLY);
    if (!m_Source.IsOpen() || file->OpenUnnamed(0600) != 0) return;
    m_Thread = std::jthread([this, &target = *file] { m_Error = Fill(target); });
    m_File = std::move(file);
}

/// On the thread. Returns errno or 0.
int DestinationDraft::Fill(NewFile& target) noexcept {
    try {
        return target.Fill([this](OutputStream& stream) { Copy(stream); }, Durability::Unsynced);
    } catch (...) {
        return ENOMEM;
    }
}

void DestinationDraft::Copy(OutputStream& stream) {
    FileCopier copier(m_Source);
    std::uint64_t position = 0;
    while (const std::uint64_t length = WaitBehind(position)) {
        if (copier.Copy(position, length, stream) != length) stream.Fail(EIO);
        if (!stream) return;
        position += length;
    }
}

/// The number of bytes behind `position` that can be copied; 0 at the end.
std::uint64_t DestinationDraft::WaitBehind(std::uint64_t position) {
    std::unique_lock lock(m_Lock);
    m_Changed.wait(lock, [&] { return m_Length > position || m_HasEnded; });
    return m_Length > position ? m_Length - position : 0;
}

/// Has the thread copy what there is up to `length` bytes, and waits for it. The process may have no
/// descriptors to spare for what comes then.
void DestinationDraft::End(std::uint64_t length) {
    {
        const std::lock_guard lock(m_Lock);
        m_HasEnded = true;
        m_Length = std::min(m_Length, length);
    }
    m_Changed.notify_one();
    m_Thread.join();
    m_Source.Close();
}

bool DestinationDraft::GiveUp() {
    m_MayBegin = false;
    if (!m_File) return false;
    if (m_Thread.joinable()) End(0);
    m_File.reset();
    return true;
}

bool DestinationDraft::Complete(const Descriptor& source) {
    struct stat followed, found;
    const bool isWhole = m_File && fstat(m_Source.Get(), &followed) == 0 &&
                         fstat(source.Get(), &found) == 0 && IsSameFile(followed, found) &&
                         static_cast<std::uint64_t>(found.st_size) == m_Length;
    if (isWhole) End(m_Length);
    if (isWhole && m_Error == 0) return true;
    GiveUp();
    return false;
}

bool DestinationDraft::TakePlace(const std::string& place, const Descriptor& old, Durability durability) {
    const bool isDone = m_File && place == m_Place && m_File->Resemble(old) == 0 &&
                        m_File->Secure(durability) == 0 && m_File->TakeName() == 0 &&
                        m_File->TakePlace(durability) == 0;
    GiveUp();
    return isDone;
}
