#include "Reading/LibraryReader.h"

#include "Reading/ChunkWalker.h"
#include "Writing/WrittenForm.h"

#include <algorithm>
#include <cstdint>
#include <string>
#include <utility>

namespace ovrin_yaml {

/// Reads the next document of a walker that began at `offset`.
bool LibraryReader::ReadNext(ChunkWalker& walker, std::size_t offset) const {
    try {
        return walker.ReadDocument();
    } catch (YAMLError& error) {
        const std::size_t place = std::min(offset + walker.Position(), m_Text.size());
        const auto linesBefore =
            std::count(m_Text.begin(), m_Text.begin() + static_cast<std::ptrdiff_t>(place), '\n');
        error.SetPlace(FileIDOf(m_Text.substr(place)), static_cast<std::uint32_t>(linesBefore) + 1);
        throw;
    }
}

bool LibraryReader::ReadDocument(std::size_t offset, std::size_t length) {
    const bool isLast = offset + length == m_Text.size();
    std::string chunk(m_Header);
    chunk.append(m_Text, offset, length);
    if (!isLast) chunk += kDocumentMark;
    ChunkWalker walker(std::move(chunk), std::string(m_Header), m_Root, m_Budget);
    if (!ReadNext(walker, offset)) return false;
    if (!isLast && walker.Position() == length) return true;
    ReadRest(offset + walker.Position());
    return false;
}

void LibraryReader::ReadRest(std::size_t offset) {
    std::string text(m_Header);
    text.append(m_Text, offset);
    ChunkWalker walker(std::move(text), std::string(m_Header), m_Root, m_Budget);
    while (ReadNext(walker, offset)) {
    }
}

} // namespace ovrin_yaml
