#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// Gives the next bytes of a file, at most `size`, and tells how many; 0 at the end. May throw.
using ByteSource = std::function<std::size_t(char* bytes, std::size_t size)>;

/// A text that is read from front to back, and of which only a part is in memory. It ends at the first NUL.
class TextWindow {
public:
    /// `size` bytes are in memory at first, more where documents are longer.
    TextWindow(ByteSource source, std::size_t size);
    /// Of a text that is in memory, which must stay.
    explicit TextWindow(std::string_view text) : m_Rest(text), m_HasEnded(true) {}

    /// What is in memory of the text from here on. Valid until more is read.
    std::string_view Rest() const { return m_Rest; }
    /// Whether the text has `length` more bytes; they are in memory then.
    bool Reaches(std::size_t length) {
        while (m_Rest.size() < length && !m_HasEnded) ReadMore(length);
        return m_Rest.size() >= length;
    }
    void Skip(std::size_t length) { m_Rest.remove_prefix(length); }
    /// The document of an object file that begins here, as far as FindDocumentEnd.
    std::string_view Document();

private:
    void ReadMore(std::size_t wanted);

    ByteSource m_Source;
    std::string m_Bytes; // those read last
    std::string_view m_Rest;
    bool m_HasEnded = false;
};

} // namespace ovrin_yaml
