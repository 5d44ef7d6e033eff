#pragma once

#include "Reading/DocumentLoader.h"
#include "Values/YAMLMapping.h"

#include <cstddef>
#include <string_view>

namespace ovrin_yaml {

class ChunkWalker;

/// Reads with libyaml what the fast reader leaves of an object file. Its failures are told with their place
/// in the file.
class LibraryReader {
public:
    /// `text` is that of the whole file and begins with `header`. Objects are added to `root`. `budget` is
    /// the file's.
    LibraryReader(std::string_view text, std::string_view header, YAMLMapping& root, AliasBudget& budget)
        : m_Text(text), m_Header(header), m_Root(root), m_Budget(budget) {}

    /// Reads the single document of `length` bytes at `offset`. If it doesn't end where the next one begins,
    /// all that follows is read as well, and false is returned. Throws YAMLError.
    bool ReadDocument(std::size_t offset, std::size_t length);
    /// Reads everything from the document at `offset` on. Throws YAMLError.
    void ReadRest(std::size_t offset);

private:
    bool ReadNext(ChunkWalker& walker, std::size_t offset) const;

    const std::string_view m_Text;
    const std::string_view m_Header;
    YAMLMapping& m_Root;
    AliasBudget& m_Budget;
};

} // namespace ovrin_yaml
