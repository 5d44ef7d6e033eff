#include "Reading/TextWindow.h"

#include "Reading/DocumentCut.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace ovrin_yaml {

TextWindow::TextWindow(ByteSource source, std::size_t size)
    : m_Source(std::move(source)), m_Bytes(size, '\0') {}

/// Moves what is left to the front and fills the room behind it, at least half of `wanted` bytes: whoever
/// asks for as many at each of many small steps shall not have them moved at each.
void TextWindow::ReadMore(std::size_t wanted) {
    const std::size_t left = m_Rest.size();
    std::copy_n(m_Rest.data(), left, m_Bytes.data());
    if (m_Bytes.size() < left + wanted / 2 || m_Bytes.size() < wanted) m_Bytes.resize(wanted + wanted / 2);
    char* const bytes = m_Bytes.data() + left;
    std::size_t count = m_Source(bytes, m_Bytes.size() - left);
    const void* const nul = std::memchr(bytes, '\0', count);
    m_HasEnded = count == 0 || nul;
    if (nul) count = static_cast<std::size_t>(static_cast<const char*>(nul) - bytes);
    m_Rest = std::string_view(m_Bytes).substr(0, left + count);
}

std::string_view TextWindow::Document() {
    std::size_t length = 0;
    do {
        const char* const begin = m_Rest.data();
        length = static_cast<std::size_t>(FindDocumentEnd(begin, begin + m_Rest.size()) - begin);
        // One that ends with the window may go on behind it; to look there may move the window.
    } while (length == m_Rest.size() && Reaches(length + 1));
    return m_Rest.substr(0, length);
}

} // namespace ovrin_yaml
