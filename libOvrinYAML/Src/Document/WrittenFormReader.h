#pragma once

#include "Document/BatchedBuilder.h"
#include "Document/YAMLMapping.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// Reads a document in the form that the writer gives it, many times faster than a YAML parser.
///
///     --- !o!4 &12 stripped         header line
///     Transform:                    block mapping; a mapping inside is two columns further in
///       m_Children:
///       - {fileID: 14}              list items at the column of their key; flow collections,
///       m_Name: 'a: b'              plain and quoted texts, on one or several lines
///
/// It knows no comment, tag, anchor, directive or tab, and nothing but ASCII. Whatever it isn't sure of, be
/// it wrong or only unusual, it leaves to the library's parser, so that this alone decides what a document
/// means. For what it accepts the tree is the one that the parser's events give, with the same hashes and
/// lines.
///
/// One reader serves any number of documents, on one thread.
class WrittenFormReader {
public:
    struct Document {
        YAMLMapping* object = nullptr; // owned by the caller; null: not sure
        std::string_view classID;      // both point into the document
        std::string_view fileID;
        bool isStripped = false;
        /// No mapping in it has a key twice.
        bool isRegular = false;
        /// The writer would write the object as these very bytes. Only said of regular ones.
        bool isAsWritten = false;
    };

    /// `text` reaches from the "---" of the document up to that of the next or to the end of the file; the
    /// byte behind it must be readable. `firstLine` is the zero-based line of the "---".
    Document Read(std::string_view text, std::uint32_t firstLine);

private:
    /// Thrown where the reader isn't sure, and caught by Read.
    struct NotSure {};

    void ReadHeaderLine(Document& document);
    std::string_view ReadId();
    void AddText(const char* begin, const char* end) {
        m_Builder.AddText({begin, end}, static_cast<std::size_t>(m_End - begin));
    }
    void NextLine();
    bool AtListItem() const;
    std::ptrdiff_t Column(const char* position) const { return position - m_LineStart; }
    void NoteIf(bool differs) { m_IsAsWritten = m_IsAsWritten && !differs; }
    void NoteText(const char* begin, const char* end);
    void NoteKey(const char* begin, const char* end);

    void ReadBlockMapping(int indent);
    void ReadBlockValue(int indent);
    void ReadBlockSequence(int indent);
    void ReadItem(int indent);
    void ReadInline(int indent);
    void ReadPlainLines(int indent);
    const char* ScanPlain(const char* from) const;

    void ReadFlow();
    void ReadFlowMapping();
    void ReadFlowSequence();
    void ReadFlowValue();
    void OpenFlow(YAMLNode::Kind kind);
    bool ReadFlowSeparator(char close);
    void ReadFlowPlain();

    void ReadQuoted(bool inFlow);
    void ReadQuotedWithFolds(const char* from);
    void FoldLines();
    void Unescape();
    std::uint32_t ReadHex(int digits);

    class Nesting;

    BatchedBuilder m_Builder;
    std::string m_Text; // of a scalar that doesn't stand in the document as it is
    const char* m_Position = nullptr;
    const char* m_End = nullptr;
    const char* m_LineStart = nullptr;
    std::uint32_t m_Line = 0; // of m_Position
    int m_Indent = 0;         // blanks in front of the line under way; -1 at the end of the document
    int m_Depth = 0;
    int m_FlowIndent = 0; // where a flow collection goes on in a new line
    bool m_IsAsWritten = false;
};

} // namespace ovrin_yaml
