#pragma once

#include "Values/Arena.h"

#include <algorithm>
#include <cstddef>
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
    std::string Take() { return std::move(m_Text); }

private:
    /// Much text is given at once the room that it takes if the file goes on as it began: memory that is
    /// moved is touched twice.
    void Grow(std::size_t length, std::size_t offset) {
        constexpr std::size_t kMuch = std::size_t{1} << 20;
        const std::size_t needed = m_Text.size() + length;
        std::size_t room = std::max(needed, 2 * m_Text.capacity());
        if (needed >= kMuch) {
            const double share = static_cast<double>(needed) / static_cast<double>(offset + length);
            const double expected = 1.05 * share * static_cast<double>(m_FileSize);
            room = std::max(room, static_cast<std::size_t>(expected));
        }
        m_Text.reserve(room);
        AdviseHugePages(m_Text.data() + m_Text.size(), m_Text.capacity() - m_Text.size());
    }

    const std::size_t m_FileSize;
    std::string m_Text;
};

} // namespace ovrin_yaml
