#pragma once

#include "Descriptor.h"
#include "OutputStream.h"

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <memory>
#include <unistd.h>

/// Copies ranges of an open file, which must stay open, into streams.
class FileCopier {
public:
    explicit FileCopier(const Descriptor& source) : m_Source(source) {}

    /// Copies `length` bytes from `position` on, or fewer where the file ends or something fails, of which
    /// the stream knows then. Returns how many.
    std::uint64_t Copy(std::uint64_t position, std::uint64_t length, OutputStream& stream) {
        std::uint64_t copied = 0;
        while (stream && copied < length) {
            const auto wanted =
                static_cast<std::size_t>(std::min<std::uint64_t>(kPieceSize, length - copied));
            const auto place = static_cast<off_t>(position + copied);
            const ssize_t count =
                Uninterrupted([&] { return pread(m_Source.Get(), m_Piece.get(), wanted, place); });
            if (count < 0) stream.Fail(errno);
            if (count <= 0) break;
            stream.write(m_Piece.get(), count);
            copied += static_cast<std::uint64_t>(count);
        }
        return copied;
    }

private:
    static constexpr std::size_t kPieceSize = std::size_t{1} << 20;

    const Descriptor& m_Source;
    const std::unique_ptr<char[]> m_Piece = std::make_unique_for_overwrite<char[]>(kPieceSize);
};
