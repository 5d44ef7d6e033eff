#include "Descriptor.h"

#include <csignal>
#include <fcntl.h>
#include <poll.h>
#include <unistd.h>
#include <utility>

Descriptor::Descriptor(Descriptor&& other) noexcept : m_Value(std::exchange(other.m_Value, -1)) {}

Descriptor& Descriptor::operator=(Descriptor&& other) noexcept {
    std::swap(m_Value, other.m_Value);
    return *this;
}

/// An interrupted close has closed the file all the same.
int Descriptor::Close() {
    const int value = std::exchange(m_Value, -1);
    return value < 0 || close(value) == 0 || errno == EINTR ? 0 : errno;
}

Descriptor OpenFile(const char* path, int flags, mode_t mode) {
    return Descriptor(Uninterrupted([&] { return open(path, flags | O_CLOEXEC | O_NOCTTY, mode); }));
}

Descriptor Duplicate(int file) {
    return Descriptor(Uninterrupted([&] { return fcntl(file, F_DUPFD_CLOEXEC, 0); }));
}

int WriteFully(int file, const char* bytes, std::size_t length) {
    while (length > 0) {
        const ssize_t count = Uninterrupted([&] { return write(file, bytes, length); });
        if (count < 0 && errno == EAGAIN) {
            pollfd readiness{file, POLLOUT, 0};
            if (Uninterrupted([&] { return poll(&readiness, 1, -1); }) < 0) return errno;
            continue;
        }
        if (count < 0) return errno;
        if (count == 0) return EIO; // a file that takes nothing and names no reason
        bytes += count;
        length -= static_cast<std::size_t>(count);
    }
    return 0;
}

int SetSize(int file, off_t size) {
    return Uninterrupted([&] { return ftruncate(file, size); }) == 0 ? 0 : errno;
}

int Sync(int file) {
    if (Uninterrupted([&] { return fsync(file); }) == 0) return 0;
    return errno == EINVAL || errno == ENOSYS || errno == EOPNOTSUPP ? 0 : errno;
}

/// Handlers, since programs would inherit that a signal is ignored.
void OutliveFailedWrites() {
    for (const int signal : {SIGXFSZ, SIGPIPE}) std::signal(signal, [](int) {});
}
