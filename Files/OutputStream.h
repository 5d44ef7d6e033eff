#pragma once

#include <cstddef>
#include <memory>
#include <ostream>
#include <streambuf>

/// A stream into a descriptor that can tell why it failed. Only `Finish` promises that what was inserted is
/// written: a flush does nothing, so that a text of many lines takes few system calls.
class OutputStream : public std::ostream {
public:
    /// The descriptor stays the caller's.
    explicit OutputStream(int descriptor);

    /// Makes the stream fail with this errno, unless it has failed already.
    void Fail(int error);
    /// Writes what is pending. Returns the errno of the first failure since the beginning; 0 for none.
    int Finish();

private:
    class Buffer : public std::streambuf {
    public:
        explicit Buffer(int descriptor);
        bool WritePending();

        int error = 0; // of the first failure

    protected:
        int_type overflow(int_type character) override;
        std::streamsize xsputn(const char* text, std::streamsize length) override;

    private:
        bool Write(const char* text, std::size_t length);

        const int m_Descriptor;
        const std::unique_ptr<char[]> m_Pending;
    };

    Buffer m_Buffer;
};
