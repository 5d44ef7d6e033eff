#pragma once

#include <cstddef>
#include <iosfwd>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// Writes text with an indentation in front of every line, however the text arrives.
///
/// What is given is cut into pieces of at most 511 bytes that end at line feeds. Each call writes pieces up
/// to and including the first that has no line feed; the rest waits for the next call, in order. So a run of
/// more than 511 bytes without a line feed comes out late; what still waits at the end comes with Finish.
/// Every line is indented, an empty one too. Belongs to one thread; the stream must outlive it.
class YAMLDiffOutput {
public:
    YAMLDiffOutput(std::ostream& stream, std::size_t indentWidth)
        : m_Stream(stream), m_IndentStep(indentWidth, ' ') {}

    YAMLDiffOutput& operator<<(std::string_view text);
    YAMLDiffOutput& operator<<(std::size_t number);
    YAMLDiffOutput& operator<<(YAMLDiffOutput& (*manipulator)(YAMLDiffOutput&)) { return manipulator(*this); }

    void Indent() { m_Indent += m_IndentStep; }
    void Unindent();
    /// The column behind the indentation at which the line under way goes on, 0 at a line start.
    std::size_t Column() const { return m_Column; }
    /// Ends the line under way, if there is one.
    void EndLineIfOpen();
    /// Writes `text` so that its further lines stand under its first character.
    void WriteAligned(std::string_view text);
    /// Writes all that still waits, as further calls without text would. To be called at the end.
    void Finish();

private:
    /// Writes the next piece that waits; true if it ended a line.
    bool WritePiece();

    std::ostream& m_Stream;
    const std::string m_IndentStep;
    std::string m_Indent;
    std::string m_Pending;
    std::size_t m_Written = 0; // bytes at the start of m_Pending that are written
    std::size_t m_Column = 0;
};

YAMLDiffOutput& endl(YAMLDiffOutput& output);

} // namespace ovrin_yaml
