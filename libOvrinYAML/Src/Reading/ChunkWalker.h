#pragma once

#include "Reading/DocumentLoader.h"
#include "Values/YAMLMapping.h"

#include <cstdint>
#include <optional>
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
///
/// The time is linear in the text: directives, which the parser reads for each document, are few. The first
/// document shows that the header can be read; in front of the later ones stands only what they need of it.
/// And what is looked for in front of the walker is looked for once.
class ChunkWalker {
public:
    /// `text` begins with `header`; objects are added to `root`. `budget` is the file's. Throws YAMLError for
    /// a header of more than 100 directives.
    ChunkWalker(std::string text, std::string header, YAMLMapping& root, AliasBudget& budget);

    /// Reads one document and moves on to the next; false if it was the last. Throws YAMLError.
    bool ReadDocument();
    /// Bytes between the first document's "---" and that of the document read next.
    std::size_t Position() const { return m_Chunk; }

private:
    /// What later documents need of the header.
    struct ShortHeader {
        std::string text;
        std::uint32_t linesLeftOut = 0;
    };
    /// Where something stands next. Asked for places that rise, it has each byte looked at once.
    class NextPlace {
    public:
        template <class Find> std::size_t From(std::size_t from, const Find& find) {
            if (!m_Place || *m_Place < from) m_Place = find(from);
            return *m_Place;
        }

    private:
        std::optional<std::size_t> m_Place;
    };

    static ShortHeader Shorten(const std::string& header);
    bool BlankStrippedWord();
    /// Where the parser's input begins and ends.
    std::size_t InputBegin() const { return m_Chunk ? m_Chunk + m_Header.size() - m_Short.text.size() : 0; }
    std::size_t InputEnd(std::size_t nextHeader);
    std::size_t FindNextHeader();
    std::string_view FileID(std::size_t nextHeader);
    void MoveToNext(std::size_t stoppedAt);

    std::string m_Text;
    const std::string m_Header;
    const ShortHeader m_Short;
    const std::size_t m_HeaderAnchor; // the first "&" in the header, or npos
    YAMLMapping& m_Root;
    AliasBudget& m_Budget;
    std::size_t m_Chunk = 0;
    NextPlace m_NextHeader, m_NextMarker, m_NextAnchor, m_NextUnusual;
};

} // namespace ovrin_yaml
