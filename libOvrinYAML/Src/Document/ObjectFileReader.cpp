#include "Document/ObjectFileReader.h"

#include "Document/DocumentLoader.h"
#include "Document/YAMLScalar.h"

#include <cstring>
#include <new>
#include <string_view>

namespace ovrin_yaml {

namespace {

constexpr std::string_view kMarker = "---";
constexpr std::string_view kNextHeader = "\n--- !o!";
constexpr std::string_view kStripped = "stripped";
constexpr std::string_view kSignature = "%YAML";
constexpr std::string_view kIdCharacters = "0123456789-";

const char* const kLostPlace = "Error locating end of document sequence";

std::string_view IdAt(std::string_view text, std::size_t position) {
    if (position >= text.size()) return {};
    const std::string_view rest = text.substr(position);
    return rest.substr(0, rest.find_first_not_of(kIdCharacters));
}

/// Walks over a text, one document at a time.
///
/// A document is parsed as part of a chunk: the file's header, then the document, then the "---" of the next
/// one, so that the parser stops by itself. The chunk of a later document is made in place, by copying the
/// header over the tail of its predecessor:
///
///     HEADER--- !o!4 &12 body one body one\n--- !o!4 &14 body two     first chunk: from the start
///     HEADER--- !o!4 &12 body oHEADER--- !o!4 &14 body two            second chunk
class ChunkWalker {
public:
    ChunkWalker(std::string text, YAMLMapping& root)
        : m_Text(std::move(text)), m_Header(m_Text.substr(0, m_Text.find(kMarker))), m_Root(root) {}

    bool HasDocument() const { return m_Text.size() > m_Header.size() + 5; }

    /// Reads one document; false if it was the last.
    bool ReadDocument() {
        const bool stripped = BlankStrippedWord();
        const std::string_view input = ParserInput();
        const LoadedDocument document = LoadDocument(input);
        AddObject(document, input, stripped);
        return !AtEnd(document) && MoveToNext(document);
    }

private:
    /// The parser would not accept the word behind the anchor.
    bool BlankStrippedWord() {
        const std::size_t line = m_Chunk + m_Header.size();
        const std::size_t end = line < m_Text.size() ? m_Text.find_first_of("\r\n", line) : std::string::npos;
        if (end == std::string::npos || end == line) throw YAMLError(kLostPlace);
        if (end < kStripped.size() ||
            m_Text.compare(end - kStripped.size(), kStripped.size(), kStripped) != 0)
            return false;
        m_Text.replace(end - kStripped.size(), kStripped.size(), kStripped.size(), ' ');
        return true;
    }

    std::string_view ParserInput() const {
        const std::string_view text = m_Text;
        const std::size_t from = m_Chunk + m_Header.size() + kMarker.size();
        const std::size_t next = from < text.size() ? text.find(kNextHeader, from) : std::string_view::npos;
        if (next == std::string_view::npos) return text.substr(m_Chunk);
        return text.substr(m_Chunk, next + 1 + kMarker.size() - m_Chunk);
    }

    void AddObject(const LoadedDocument& document, std::string_view input, bool stripped) {
        YAMLMapping* object = AsMapping(document.root);
        if (!object) throw YAMLError("Document root is not a mapping");
        const std::string_view classID =
            document.hasTagDirective ? IdAt(document.tag, document.tagPrefixLength) : std::string_view();
        if (classID.empty()) throw YAMLError("Document has no class id");
        const std::size_t anchor = input.find('&');
        const std::string_view fileID =
            anchor == std::string_view::npos ? std::string_view() : IdAt(input, anchor + 1);
        if (fileID.empty()) throw YAMLError("Document has no file id");
        if (!document.aliasFailure.empty()) throw YAMLError(document.aliasFailure);
        YAMLScalar* id = YAMLScalar::Lookup(fileID);
        object->Append(YAMLScalar::fileIDPlaceHolderName, id);
        object->Append(YAMLScalar::classIDPlaceHolderName, YAMLScalar::Lookup(classID));
        if (stripped) object->Append(YAMLScalar::strippedPrefabPlaceHolderName, YAMLScalar::one);
        m_Root.Append(id, object);
    }

    bool AtEnd(const LoadedDocument& document) const {
        if (document.next != LoadedDocument::Next::Unknown) return document.next == LoadedDocument::Next::End;
        return OnlyBlanksAndComments(
            std::string_view(m_Text).substr(std::min(m_Text.size(), m_Chunk + document.stoppedAt)));
    }

    static bool OnlyBlanksAndComments(std::string_view text) {
        while (!text.empty()) {
            text.remove_prefix(std::min(text.size(), text.find_first_not_of(" \t\r\n")));
            if (text.empty()) return true;
            if (text.front() != '#') return false;
            text.remove_prefix(std::min(text.size(), text.find_first_of("\r\n")));
        }
        return true;
    }

    /// The parser counts characters and the text is counted in bytes: a document that is not ASCII puts the
    /// next chunk too early, which is noticed at the latest when that is parsed.
    bool MoveToNext(const LoadedDocument& document) {
        const std::size_t behindHeader = m_Chunk + document.stoppedAt;
        if (behindHeader < kMarker.size() + m_Header.size()) throw YAMLError(kLostPlace);
        const std::size_t next = behindHeader - kMarker.size() - m_Header.size();
        if (next <= m_Chunk || next + m_Header.size() > m_Text.size()) throw YAMLError(kLostPlace);
        m_Chunk = next;
        std::memcpy(m_Text.data() + m_Chunk, m_Header.data(), m_Header.size());
        return true;
    }

    std::string m_Text;
    const std::string m_Header;
    YAMLMapping& m_Root;
    std::size_t m_Chunk = 0;
};

} // namespace

bool ParseYAMLString(std::string text, OvrinObjects& objects) {
    ChunkWalker walker(std::move(text), objects.GetMapping());
    if (!walker.HasDocument()) return true;
    try {
        while (walker.ReadDocument()) {
        }
    } catch (const std::bad_alloc&) {
        return false;
    }
    objects.GetMapping().RebuildHash(true);
    return true;
}

bool ParseYAMLFile(std::string bytes, OvrinObjects& objects) {
    if (std::string_view(bytes).substr(0, kSignature.size() + 4).find(kSignature) == std::string_view::npos)
        throw YAMLError(
            "File is not a valid text serialized YAML file. Make sure that Asset Serialization is "
            "set to 'Force text' in Editor Settings.");
    if (const void* nul = std::memchr(bytes.data(), '\0', bytes.size()))
        bytes.resize(static_cast<const char*>(nul) - bytes.data());
    return ParseYAMLString(std::move(bytes), objects);
}

} // namespace ovrin_yaml
