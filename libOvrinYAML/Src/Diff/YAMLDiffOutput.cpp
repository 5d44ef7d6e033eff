#include "Diff/YAMLDiffOutput.h"

#include <algorithm>
#include <ostream>

namespace ovrin_yaml {

namespace {

constexpr std::size_t kLongestPiece = 511;

} // namespace

YAMLDiffOutput& YAMLDiffOutput::operator<<(std::string_view text) {
    m_Pending += text;
    while (WritePiece()) {
    }
    if (m_Written == m_Pending.size()) {
        m_Pending.clear();
        m_Written = 0;
    }
    return *this;
}

YAMLDiffOutput& YAMLDiffOutput::operator<<(std::size_t number) {
    return *this << std::to_string(number);
}

bool YAMLDiffOutput::WritePiece() {
    const std::string_view waiting = std::string_view(m_Pending).substr(m_Written);
    if (waiting.empty()) return false;
    if (m_Column == 0) m_Stream << m_Indent;
    // One more byte is looked at: the line feed may stand right behind a piece of full length.
    const std::string_view seen = waiting.substr(0, kLongestPiece + 1);
    const std::size_t lineEnd = seen.find('\n');
    const bool endsLine = lineEnd != std::string_view::npos;
    const std::string_view piece = waiting.substr(0, endsLine ? lineEnd : kLongestPiece);
    m_Stream << piece;
    m_Written += piece.size();
    m_Column += piece.size();
    if (!endsLine) return false;
    m_Stream << '\n';
    ++m_Written;
    m_Column = 0;
    return true;
}

void YAMLDiffOutput::Unindent() {
    m_Indent.resize(m_Indent.size() - std::min(m_Indent.size(), m_IndentStep.size()));
}

void YAMLDiffOutput::EndLineIfOpen() {
    if (m_Column != 0) *this << "\n";
}

void YAMLDiffOutput::WriteAligned(std::string_view text) {
    const std::string indent = m_Indent;
    m_Indent.assign(m_Column + indent.size(), ' ');
    *this << text;
    m_Indent = indent;
}

void YAMLDiffOutput::Finish() {
    while (!m_Pending.empty()) *this << "";
}

YAMLDiffOutput& endl(YAMLDiffOutput& output) {
    return output << "\n";
}

} // namespace ovrin_yaml
