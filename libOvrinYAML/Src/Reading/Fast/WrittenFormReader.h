#pragma once

#include "Reading/Fast/BatchedBuilder.h"
#include "Reading/Fast/KnownKeys.h"
#include "Values/YAMLMapping.h"

#include <cstdint>
#include <deque>
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
/// One reader serves any number of documents of one file, on one thread.
class WrittenFormReader {
public:
    struct Document {
        /// Owned by the caller, with header data behind the body. Null: not sure. Its texts are missing up to
        /// the next InternTexts.
        YAMLMapping* object = nullptr;
        /// The writer would write the object as these very bytes.
        bool isAsWritten = false;
    };

    /// Everything in front of `readableEnd` may be read.
    explicit WrittenFormReader(const char* readableEnd) : m_ReadableEnd(readableEnd) {}

    /// `text` reaches from the "---" of the document up to that of the next or to the end of the file; it
    /// must stay up to the next InternTexts. `firstLine` is the zero-based line of the "---". No mapping of
    /// an object that is given back has a key twice.
    Document Read(std::string_view text, std::uint32_t firstLine);
    /// Completes the objects read so far. Better for many of them than for each.
    void InternTexts();

private:
    /// Thrown where the reader isn't sure, and caught by Read.
    struct NotSure {};

    struct Header {
        std::string_view classID;
        std::string_view fileID;
        bool isStripped;
    };

    void Begin(std::string_view text, std::uint32_t firstLine);
    YAMLMapping* ReadObject(std::uint32_t firstLine);
    Header ReadHeaderLine();
    std::string_view ReadId();
    void ReadPairs(int indent, KnownKey& parent);
    std::size_t AddHeaderData(const Header& header);
    void CloseMapping(std::size_t mark, bool flow, std::uint32_t line, std::size_t unhashed = 0);
    void NextLine();
    bool AtListItem() const;
    std::size_t Column(const char* position) const {
        return static_cast<std::size_t>(position - m_LineStart);
    }
    void NoteIf(bool differs) { m_IsAsWritten = m_IsAsWritten && !differs; }
    void NoteText(const char* begin, const char* end);
    void NoteLongText(const char* begin, const char* end);

    // `parent` is the key that a value stands under.

    void ReadBlockMapping(int indent, KnownKey& parent);
    KnownKey* GuessBlockKey(KeyGuess& guess) const;
    KnownKey& ReadBlockKey(const KnownKey& parent, KeyGuess& guess);
    KnownKey& AddKey(const char* end, const KnownKey& parent, KeyGuess& guess);
    void ReadBlockValue(int indent, KnownKey& parent);
    void ReadBlockSequence(int indent, KnownKey& parent);
    void ReadItem(int indent, KnownKey& parent);
    void ReadInline(int indent, KnownKey& parent);
    void ReadPlainLines(int indent);
    const char* ScanPlain(const char* from) const;

    void ReadFlow(KnownKey& parent);
    void ReadFlowMapping(KnownKey& parent);
    KnownKey& ReadFlowKey(const KnownKey& parent, KeyGuess& guess);
    void ReadFlowSequence(KnownKey& parent);
    void ReadFlowValue(KnownKey& parent);
    bool SkipUsualSeparator();
    bool ReadFlowSeparator(char close);
    const char* ScanFlowPlain();

    void AddQuoted(std::string_view text);
    std::string_view ReadQuoted(bool inFlow);
    std::string_view ReadQuotedWithFolds(const char* from);
    void FoldLines();
    void Unescape();
    std::uint32_t ReadHex(int digits);

    class Nesting;

    const char* const m_ReadableEnd;
    BatchedBuilder m_Builder;
    KnownKeys m_KnownKeys;
    std::deque<std::string> m_Copies; // of documents at the end of what may be read
    std::string m_Text;               // of a scalar that doesn't stand in the document as it is
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
