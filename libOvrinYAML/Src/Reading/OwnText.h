#pragma once

#include "Values/Arena.h"

#include <algorithm>
#include <cstddef>
#include <new>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace ovrin_yaml {

/// The texts that are kept of a file that goes by, one behind the other.
class OwnText {
public:
    /// `fileSize`: as far as it is known.
    explicit OwnText(std::size_t fileSize) : m_FileSize(fileSize) {}

    /// `offset`: where the text stands in the file.
    void Append(std::string_view text, std::size_t offset) {
        if (m_Text.capacity() - m_Text.size() < text.size()) Grow(text.size(), offset);
        m_Text += text;
    }
    /// The file may have gone on in another way than it began: most of much room isn't kept for nothing.
    std::string Take() {
        if (m_Text.capacity() / 2 > m_Text.size()) m_Text.shrink_to_fit();
        return std::move(m_Text);
    }

private:
    /// Much text is given at once the room that it takes if the file goes on as it began: memory that is
    /// moved is touched twice. Where there isn't so much, it may not be needed.
    void Grow(std::size_t length, std::size_t offset) {
        constexpr std::size_t kMuch = std::size_t{1} << 20;
        const std::size_t needed = m_Text.size() + length;
        const std::size_t doubled = std::max(needed, 2 * m_Text.capacity());
        const double share = static_cast<double>(needed) / static_cast<double>(offset + length);
        const double expected = 1.05 * share * static_cast<double>(m_FileSize);
        const auto room = static_cast<std::size_t>(expected);
        if (needed < kMuch || room <= doubled || !TryReserve(room)) m_Text.reserve(doubled);
        AdviseHugePages(m_Text.data() + m_Text.size(), m_Text.capacity() - m_Text.size());
    }

    bool TryReserve(std::size_t room) {
        try {
            m_Text.reserve(room);
            return true;
        } catch (const std::bad_alloc&) {
            return false;
        } catch (const std::length_error&) {
            return false;
        }
    }

    const std::size_t m_FileSize;
    std::string m_Text;
};

} // namespace ovrin_yaml
