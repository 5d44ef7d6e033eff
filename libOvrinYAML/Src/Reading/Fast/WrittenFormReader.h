#pragma once

#include "Reading/Fast/FlowReader.h"
#include "Reading/Fast/FormReading.h"
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
    struct Header {
        std::string_view classID;
        std::string_view fileID;
        bool isStripped;
    };

    std::string_view Readable(std::string_view text);
    YAMLMapping* ReadObject(std::uint32_t firstLine);
    Header ReadHeaderLine();
    std::string_view ReadId();
    std::size_t AddHeaderData(const Header& header);

    // Block style. Each function begins at the first character of its node and ends at that of the next line
    // that is not its own. `parent` is the key that a value stands under.

    void ReadMapping(int indent, KnownKey& parent);
    void ReadPairs(int indent, KnownKey& parent);
    KnownKey* GuessKey(KeyGuess& guess) const;
    KnownKey& ReadKey(const KnownKey& parent, KeyGuess& guess);
    void ReadValue(int indent, KnownKey& parent);
    void ReadSequence(int indent, KnownKey& parent);
    void ReadItem(int indent, KnownKey& parent);
    void ReadInline(int indent, KnownKey& parent);
    void ReadPlainText(int indent);
    std::string_view ReadPlainLine();
    void ReadFoldedText(int indent, std::string_view firstLine, std::size_t width);

    const char* const m_ReadableEnd;
    FormReading m_Form;
    FlowReader m_Flow{m_Form};
    std::deque<std::string> m_Copies; // of documents at the end of what may be read
    std::string m_FoldedText;         // of a scalar that stands on several lines
};

} // namespace ovrin_yaml
