#include "Reading/ChunkWalker.h"

#include "Values/YAMLScalar.h"
#include "Writing/WrittenForm.h"

#include <algorithm>

namespace ovrin_yaml {

namespace {

/// More than the parser decodes ahead of what it scans.
constexpr std::size_t kDecodedAhead = std::size_t{64} << 10;

/// The parser compares the directives of a header with each other, for every document.
constexpr int kMostDirectives = 100;

const char* const kLostPlace = "Error locating end of document sequence";

void RequireFewDirectives(std::string_view header) {
    int directives = 0;
    for (std::size_t at = 0; (at = header.find('%', at)) != header.npos; ++at)
        if (at == 0 || header[at - 1] == '\n' || header[at - 1] == '\r') ++directives;
    if (directives > kMostDirectives) throw YAMLError("Too many directives");
}

bool IsUnusual(char c) {
    return !IsPrintable(c) && c != '\t' && c != '\n' && c != '\r';
}

/// Whether the parser takes what stands at the start of a line for a marker, wherever it meets it.
bool IsMarker(std::string_view line) {
    constexpr std::string_view kBehind = " \t\r\n";
    return line.starts_with(kDocumentMark) &&
           (line.size() == kDocumentMark.size() || kBehind.find(line[kDocumentMark.size()]) != kBehind.npos);
}

/// The line end in front of the next marker, or npos.
std::size_t FindMarker(std::string_view text, std::size_t from) {
    constexpr std::string_view kMarkerLine = kNextHeader.substr(0, 1 + kDocumentMark.size());
    std::size_t found = text.find(kMarkerLine, from);
    while (found != text.npos && !IsMarker(text.substr(found + 1))) found = text.find(kMarkerLine, found + 1);
    return found;
}

void AddDocument(YAMLMapping& root, const LoadedDocument& document, std::string_view fileID,
                 bool isStripped) {
    YAMLMapping* object = AsMapping(document.root);
    if (!object) throw YAMLError("Document root is not a mapping");
    const std::string_view classID =
        document.hasTagDirective ? IdAt(document.tag, document.tagPrefixLength) : std::string_view();
    if (classID.empty()) throw YAMLError("Document has no class id");
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
    : m_Text(std::move(text)), m_Header(std::move(header)), m_Short(Shorten(m_Header)),
      m_HeaderAnchor(m_Header.find(kAnchorSign)), m_Root(root), m_Budget(budget) {
    RequireFewDirectives(m_Header);
}

/// The directives of a header that consists of complete ASCII lines; the whole of any other. Whether a
/// directive stands in the last line decides what the parser makes of blanks behind the header, so that a
/// line that is no directive becomes an empty one there.
ChunkWalker::ShortHeader ChunkWalker::Shorten(const std::string& header) {
    ShortHeader whole{header, 0};
    ShortHeader result;
    if (std::any_of(header.begin(), header.end(), IsUnusual)) return whole;
    bool isDirective = true;
    for (std::string_view rest = header; !rest.empty();) {
        const std::size_t end = rest.find_first_of("\r\n");
        if (end == rest.npos) return whole;
        const std::string_view line = rest.substr(0, end);
        const std::string_view lineEnd = rest.substr(end, rest.substr(end).starts_with("\r\n") ? 2 : 1);
        rest.remove_prefix(end + lineEnd.size());
        isDirective = line.starts_with('%');
        if (isDirective) {
            result.text.append(line.substr(0, line.find('#'))).append(lineEnd);
        } else {
            const std::size_t first = line.find_first_not_of(" \t");
            if (first != line.npos && line[first] != '#') return whole;
            ++result.linesLeftOut;
        }
    }
    if (isDirective) return result;
    result.text += '\n';
    --result.linesLeftOut;
    return result;
}

bool ChunkWalker::ReadDocument() {
    const bool isStripped = BlankStrippedWord();
    const std::size_t nextHeader = FindNextHeader();
    const std::size_t begin = InputBegin();
    const std::string_view input = std::string_view(m_Text).substr(begin, InputEnd(nextHeader) - begin);
    const LoadedDocument document = LoadDocument(input, m_Budget, m_Chunk ? m_Short.linesLeftOut : 0);
    AddDocument(m_Root, document, FileID(nextHeader), isStripped);
    if (document.next == LoadedDocument::Next::End) return false;
    if (document.next == LoadedDocument::Next::Unknown) {
        const std::size_t behind = begin + BytesOf(input, document.stoppedAt);
        if (OnlyBlanksAndComments(std::string_view(m_Text).substr(behind))) return false;
    }
    MoveToNext(begin - m_Chunk + document.stoppedAt);
    return true;
}

/// The parser would not accept the word behind the anchor.
bool ChunkWalker::BlankStrippedWord() {
    const std::size_t line = m_Chunk + m_Header.size();
    const std::size_t end = line < m_Text.size() ? m_Text.find_first_of("\r\n", line) : std::string::npos;
    if (end == std::string::npos || end == line) throw YAMLError(kLostPlace);
    if (end < kStrippedWord.size() ||
        m_Text.compare(end - kStrippedWord.size(), kStrippedWord.size(), kStrippedWord) != 0)
        return false;
    m_Text.replace(end - kStrippedWord.size(), kStrippedWord.size(), kStrippedWord.size(), ' ');
    return true;
}

/// The line end in front of the next document's header line, or npos.
std::size_t ChunkWalker::FindNextHeader() {
    return m_NextHeader.From(m_Chunk + m_Header.size() + kDocumentMark.size(),
                             [this](std::size_t from) { return m_Text.find(kNextHeader, from); });
}

/// Behind the "---" of the next header line or at the end of the text, so that the parser finds there what
/// ends the document. Behind an earlier marker of any kind, where it stops by itself, if what it would decode
/// ahead holds nothing that it could refuse: decoding that again for each document takes most of the time.
std::size_t ChunkWalker::InputEnd(std::size_t nextHeader) {
    const std::string_view text = m_Text;
    const std::size_t end = nextHeader == text.npos ? text.size() : nextHeader + 1 + kDocumentMark.size();
    const std::size_t line = m_Chunk + m_Header.size();
    // A chunk that lies wrong, or whose header swallows the marker, may find its own one later.
    if (!m_Header.ends_with('\n') || !IsMarker(text.substr(line))) return end;
    const std::size_t marker = m_NextMarker.From(line + kDocumentMark.size(),
                                                 [text](std::size_t from) { return FindMarker(text, from); });
    if (marker == nextHeader) return end;
    const std::size_t unusual = m_NextUnusual.From(line, [text](std::size_t from) -> std::size_t {
        return std::find_if(text.begin() + from, text.end(), IsUnusual) - text.begin();
    });
    return unusual == text.size() || unusual > marker + kDecodedAhead ? marker + 1 + kDocumentMark.size()
                                                                      : end;
}

/// Behind the first "&" in front of the next header line; that may be one in the file's header.
std::string_view ChunkWalker::FileID(std::size_t nextHeader) {
    const std::string_view text = m_Text;
    if (m_HeaderAnchor != text.npos) {
        // A header that isn't whole in front of the document consists of whole lines, and so the id ends
        // there.
        const bool isWhole = InputBegin() == m_Chunk;
        return isWhole ? IdAt(text, m_Chunk + m_HeaderAnchor + 1) : IdAt(m_Header, m_HeaderAnchor + 1);
    }
    const std::size_t anchor = m_NextAnchor.From(
        m_Chunk + m_Header.size(), [text](std::size_t from) { return text.find(kAnchorSign, from); });
    return anchor < nextHeader ? IdAt(text, anchor + 1) : std::string_view();
}

/// The parser counts characters and the text is counted in bytes: a document that is not ASCII puts the next
/// chunk too early, which is noticed at the latest when that is parsed.
void ChunkWalker::MoveToNext(std::size_t stoppedAt) {
    const std::size_t behindHeader = m_Chunk + stoppedAt;
    if (behindHeader < kDocumentMark.size() + m_Header.size()) throw YAMLError(kLostPlace);
    const std::size_t next = behindHeader - kDocumentMark.size() - m_Header.size();
    if (next <= m_Chunk || next + m_Header.size() > m_Text.size()) throw YAMLError(kLostPlace);
    m_Chunk = next;
    m_Short.text.copy(m_Text.data() + InputBegin(), m_Short.text.size());
}

} // namespace ovrin_yaml
