#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <ostream>
#include <streambuf>
#include <utility>

/// A stream into a descriptor that can tell why it failed. Only `Finish` promises that what was inserted is
/// written: a flush does nothing, so that a text of many lines takes few system calls.
class OutputStream : public std::ostream {
public:
    /// The descriptor stays the caller's.
    explicit OutputStream(int descriptor);

    /// Makes the stream fail with this errno, unless it has failed already.
    void Fail(int error);
    /// Calls `watch(length)` whenever the first `length` of the bytes that were inserted have been written.
    void Watch(std::function<void(std::uint64_t length)> watch) { m_Buffer.watch = std::move(watch); }
    /// Writes what is pending. Returns the errno of the first failure since the beginning; 0 for none.
    int Finish();

private:
    class Buffer : public std::streambuf {
    public:
        explicit Buffer(int descriptor);
        bool WritePending();

        int error = 0; // of the first failure
        std::function<void(std::uint64_t)> watch;

    protected:
        int_type overflow(int_type character) override;
        std::streamsize xsputn(const char* text, std::streamsize length) override;

    private:
        bool Write(const char* text, std::size_t length);

        const int m_Descriptor;
        std::uint64_t m_Written = 0;
        const std::unique_ptr<char[]> m_Pending;
    };

    Buffer m_Buffer;
};
