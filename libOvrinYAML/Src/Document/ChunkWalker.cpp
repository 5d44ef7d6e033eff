#include "Document/ChunkWalker.h"

#include "Document/YAMLScalar.h"

#include <algorithm>
#include <cstring>

namespace ovrin_yaml {

namespace {

constexpr std::string_view kMarker = "---";
constexpr std::string_view kNextHeader = "\n--- !o!";
constexpr std::string_view kStripped = "stripped";
constexpr std::string_view kIdCharacters = "0123456789-";

const char* const kLostPlace = "Error locating end of document sequence";

std::string_view IdAt(std::string_view text, std::size_t position) {
    if (position >= text.size()) return {};
    const std::string_view rest = text.substr(position);
    return rest.substr(0, rest.find_first_not_of(kIdCharacters));
}

std::string_view FileIDIn(std::string_view input) {
    const std::size_t anchor = input.find('&');
    return anchor == std::string_view::npos ? std::string_view() : IdAt(input, anchor + 1);
}

void AddDocument(YAMLMapping& root, const LoadedDocument& document, std::string_view input, bool isStripped) {
    YAMLMapping* object = AsMapping(document.root);
    if (!object) throw YAMLError("Document root is not a mapping");
    const std::string_view classID =
        document.hasTagDirective ? IdAt(document.tag, document.tagPrefixLength) : std::string_view();
    if (classID.empty()) throw YAMLError("Document has no class id");
    const std::string_view fileID = FileIDIn(input);
    if (fileID.empty()) throw YAMLError("Document has no file id");
    if (!document.aliasFailure.empty()) throw YAMLError(document.aliasFailure);
    YAMLScalar* id = YAMLScalar::Lookup(fileID);
    AddHeaderData(*object, id, classID, isStripped);
    root.Append(id, object);
}

/// Bytes in the first `characters` characters that the parser counts in its input. A byte order mark is none.
std::size_t BytesOf(std::string_view input, std::size_t characters) {
    std::size_t bytes = input.starts_with("\xef\xbb\xbf") ? 3 : 0;
    const auto continues = [](char c) { return (c & 0xc0) == 0x80; };
    for (; characters && bytes < input.size(); --characters)
        for (++bytes; bytes < input.size() && continues(input[bytes]);) ++bytes;
    return bytes;
}

bool OnlyBlanksAndComments(std::string_view text) {
    while (!text.empty()) {
        text.remove_prefix(std::min(text.size(), text.find_first_not_of(" \t\r\n")));
        if (text.empty()) return true;
        if (text.front() != '#') return false;
        text.remove_prefix(std::min(text.size(), text.find_first_of("\r\n")));
    }
    return true;
}

} // namespace

void AddHeaderData(YAMLMapping& object, YAMLScalar* fileID, std::string_view classID, bool isStripped) {
    object.Append(YAMLScalar::fileIDPlaceHolderName, fileID);
    object.Append(YAMLScalar::classIDPlaceHolderName, YAMLScalar::Lookup(classID));
    if (isStripped) object.Append(YAMLScalar::strippedPrefabPlaceHolderName, YAMLScalar::one);
}

ChunkWalker::ChunkWalker(std::string text, std::string header, YAMLMapping& root, AliasBudget& budget)
    : m_Text(std::move(text)), m_Header(std::move(header)), m_Root(root), m_Budget(budget) {}

bool ChunkWalker::ReadDocument() {
    const bool isStripped = BlankStrippedWord();
    const std::string_view input = ParserInput();
    const LoadedDocument document = LoadDocument(input, m_Budget);
    AddDocument(m_Root, document, input, isStripped);
    if (document.next == LoadedDocument::Next::End) return false;
    if (document.next == LoadedDocument::Next::Unknown) {
        const std::size_t behind = m_Chunk + BytesOf(input, document.stoppedAt);
        if (OnlyBlanksAndComments(std::string_view(m_Text).substr(behind))) return false;
    }
    MoveToNext(document.stoppedAt);
    return true;
}

/// The parser would not accept the word behind the anchor.
bool ChunkWalker::BlankStrippedWord() {
    const std::size_t line = m_Chunk + m_Header.size();
    const std::size_t end = line < m_Text.size() ? m_Text.find_first_of("\r\n", line) : std::string::npos;
    if (end == std::string::npos || end == line) throw YAMLError(kLostPlace);
    if (end < kStripped.size() || m_Text.compare(end - kStripped.size(), kStripped.size(), kStripped) != 0)
        return false;
    m_Text.replace(end - kStripped.size(), kStripped.size(), kStripped.size(), ' ');
    return true;
}

std::string_view ChunkWalker::ParserInput() const {
    const std::string_view text = m_Text;
    const std::size_t from = m_Chunk + m_Header.size() + kMarker.size();
    const std::size_t next = from < text.size() ? text.find(kNextHeader, from) : std::string_view::npos;
    if (next == std::string_view::npos) return text.substr(m_Chunk);
    return text.substr(m_Chunk, next + 1 + kMarker.size() - m_Chunk);
}

/// The parser counts characters and the text is counted in bytes: a document that is not ASCII puts the next
/// chunk too early, which is noticed at the latest when that is parsed.
void ChunkWalker::MoveToNext(std::size_t stoppedAt) {
    const std::size_t behindHeader = m_Chunk + stoppedAt;
    if (behindHeader < kMarker.size() + m_Header.size()) throw YAMLError(kLostPlace);
    const std::size_t next = behindHeader - kMarker.size() - m_Header.size();
    if (next <= m_Chunk || next + m_Header.size() > m_Text.size()) throw YAMLError(kLostPlace);
    m_Chunk = next;
    std::memcpy(m_Text.data() + m_Chunk, m_Header.data(), m_Header.size());
}

} // namespace ovrin_yaml
