#pragma once

#include "Document/DocumentLoader.h"
#include "Document/YAMLMapping.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace ovrin_yaml {

class YAMLScalar;

/// Adds what a document's header line says to its object.
void AddHeaderData(YAMLMapping& object, YAMLScalar* fileID, std::string_view classID, bool isStripped);

/// Walks over the text of an object file with libyaml, one document at a time.
///
/// A document is parsed as part of a chunk: the file's header, then the document, then the "---" of the next
/// one, so that the parser stops by itself. The chunk of a later document is made in place, by copying the
/// header over the tail of its predecessor:
///
///     HEADER--- !o!4 &12 body one body one\n--- !o!4 &14 body two     first chunk: from the start
///     HEADER--- !o!4 &12 body oHEADER--- !o!4 &14 body two            second chunk
class ChunkWalker {
public:
    /// `text` begins with `header`; objects are added to `root`. `budget` is the file's.
    ChunkWalker(std::string text, std::string header, YAMLMapping& root, AliasBudget& budget);

    /// Reads one document and moves on to the next; false if it was the last. Throws YAMLError.
    bool ReadDocument();
    /// Bytes between the first document's "---" and that of the document read next.
    std::size_t Position() const { return m_Chunk; }

private:
    bool BlankStrippedWord();
    std::string_view ParserInput() const;
    void MoveToNext(std::size_t stoppedAt);

    std::string m_Text;
    const std::string m_Header;
    YAMLMapping& m_Root;
    AliasBudget& m_Budget;
    std::size_t m_Chunk = 0;
};

} // namespace ovrin_yaml
