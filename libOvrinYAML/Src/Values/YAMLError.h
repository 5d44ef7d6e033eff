#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

namespace ovrin_yaml {

/// The exception of the document library: one text, and the place as far as it is known. It has no base class
/// on purpose, so that a handler for std::exception tells the library's own failures from all others.
class YAMLError {
public:
    explicit YAMLError(std::string text) : m_Text(std::move(text)) {}
    const std::string& what() const { return m_Text; }

    /// The file id of the object where it was found, and the line at which that begins; empty and 0 where
    /// they aren't known.
    const std::string& Object() const { return m_Object; }
    std::uint32_t Line() const { return m_Line; }
    /// For those on the way who know the place. The first counts, who is the nearest.
    void SetPlace(std::string_view object, std::uint32_t line = 0) {
        if (!m_Object.empty()) return;
        m_Object = object;
        m_Line = line;
    }

private:
    std::string m_Text;
    std::string m_Object;
    std::uint32_t m_Line = 0;
};

} // namespace ovrin_yaml
