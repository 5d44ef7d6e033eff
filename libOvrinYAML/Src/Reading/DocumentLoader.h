#pragma once

#include "Values/YAMLNode.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// What one YAML document holds, and where its parser stopped.
struct LoadedDocument {
    /// The tree under the root, owned by the caller; null if there is no document in the text.
    YAMLNode* root = nullptr;
    /// The root's resolved tag, the implicit one included.
    std::string tag;
    bool hasTagDirective = false;
    /// Bytes in the prefix of the first %TAG directive.
    std::size_t tagPrefixLength = 0;
    /// A failure that waits for its turn behind the tests of the root and of its ids; empty if there is none.
    std::string aliasFailure;

    /// What follows the document: its successor's marker, the end of the text, or nothing that the parser has
    /// looked at yet, which is so behind an explicit end marker "...".
    enum class Next { Marker, End, Unknown };
    Next next = Next::Unknown;
    /// Characters, not bytes, between the start of the text and the end of the last token that was scanned.
    std::size_t stoppedAt = 0;
};

/// What the aliases of one file may still stand for, all its documents together: a few lines of aliases to
/// aliases can stand for more nodes than any machine holds.
struct AliasBudget {
    std::uint64_t nodes = 10'000'000;
};

/// Parses the first document of `text` with libyaml and builds its tree, with content hashes and lines, which
/// are counted from `firstLine` on.
///
/// Aliases are expanded: each gets a copy of its own, at the expense of `budget`. Pairs whose key is no
/// scalar are dropped. Throws YAMLError with the problem's text for what libyaml refuses, for a %YAML version
/// other than 1.1, for text in UTF-16, and for nesting beyond 1,000 levels; std::bad_alloc if there is no
/// memory.
LoadedDocument LoadDocument(std::string_view text, AliasBudget& budget, std::uint32_t firstLine = 0);

} // namespace ovrin_yaml
