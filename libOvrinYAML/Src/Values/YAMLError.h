#pragma once

#include <string>
#include <utility>

namespace ovrin_yaml {

/// The exception of the document library: one text. It has no base class on purpose, so that a handler
/// for std::exception tells the library's own failures from all others.
class YAMLError {
public:
    explicit YAMLError(std::string text) : m_Text(std::move(text)) {}
    const std::string& what() const { return m_Text; }

private:
    std::string m_Text;
};

} // namespace ovrin_yaml
