#include "OutputStream.h"

#include "Descriptor.h"

namespace {

constexpr std::size_t kBufferSize = std::size_t{64} * 1024;

} // namespace

OutputStream::OutputStream(int descriptor) : std::ostream(nullptr), m_Buffer(descriptor) {
    rdbuf(&m_Buffer);
}

void OutputStream::Fail(int error) {
    if (m_Buffer.error == 0) m_Buffer.error = error;
    setstate(badbit);
}

int OutputStream::Finish() {
    m_Buffer.WritePending();
    return m_Buffer.error;
}

OutputStream::Buffer::Buffer(int descriptor)
    : m_Descriptor(descriptor), m_Pending(std::make_unique_for_overwrite<char[]>(kBufferSize)) {
    setp(m_Pending.get(), m_Pending.get() + kBufferSize);
}

OutputStream::Buffer::int_type OutputStream::Buffer::overflow(int_type character) {
    if (!WritePending()) return traits_type::eof();
    if (!traits_type::eq_int_type(character, traits_type::eof())) sputc(traits_type::to_char_type(character));
    return traits_type::not_eof(character);
}

std::streamsize OutputStream::Buffer::xsputn(const char* text, std::streamsize length) {
    if (length > epptr() - pptr())
        return WritePending() && Write(text, static_cast<std::size_t>(length)) ? length : 0;
    traits_type::copy(pptr(), text, static_cast<std::size_t>(length));
    pbump(static_cast<int>(length));
    return length;
}

bool OutputStream::Buffer::WritePending() {
    const bool isWritten = Write(pbase(), static_cast<std::size_t>(pptr() - pbase()));
    setp(m_Pending.get(), m_Pending.get() + kBufferSize);
    return isWritten;
}

/// Behind a failure nothing more is written: a hole in the middle would be worse than a missing end.
bool OutputStream::Buffer::Write(const char* text, std::size_t length) {
    if (error == 0) error = WriteFully(m_Descriptor, text, length);
    if (error != 0) return false;
    m_Written += length;
    if (watch) watch(m_Written);
    return true;
}
