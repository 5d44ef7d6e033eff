#pragma once

#include <cerrno>
#include <cstddef>
#include <sys/types.h>

/// Owns an open file, or none. Not for several threads at once.
class Descriptor {
public:
    explicit Descriptor(int value = -1) : m_Value(value) {}
    Descriptor(Descriptor&& other) noexcept;
    Descriptor& operator=(Descriptor&& other) noexcept;
    /// Closes without asking how that went.
    ~Descriptor() { Close(); }

    bool IsOpen() const { return m_Value >= 0; }
    int Get() const { return m_Value; }
    /// Closes the file, if it is open. Returns the errno of what only closing tells; 0 for nothing.
    int Close();

private:
    int m_Value;
};

/// Repeats a system call that a signal interrupts.
template <class Call> auto Uninterrupted(const Call& call) {
    auto result = call();
    while (result == -1 && errno == EINTR) result = call();
    return result;
}

/// Opens a file for this process alone; not open, with errno set, on failure. Signals don't disturb this and
/// the functions below.
Descriptor OpenFile(const char* path, int flags, mode_t mode = 0);

/// A second descriptor of the same open file, for this process alone: closing it tells what closing `file`
/// would tell. Not open, with errno set, on failure.
Descriptor Duplicate(int file);

/// Writes all the bytes, waiting for a reader where the file doesn't wait by itself. Returns errno or 0.
int WriteFully(int file, const char* bytes, std::size_t length);

/// Cuts or lengthens the file. Returns errno or 0.
int SetSize(int file, off_t size);

/// Brings the file to the disk. A file system that doesn't know this has not failed. Returns errno or 0.
int Sync(int file);

/// Makes a file that outgrows the limit of the process, and a pipe that nobody reads any more, what can't be
/// written, instead of the end of the process. Programs that are started don't inherit this.
void OutliveFailedWrites();
