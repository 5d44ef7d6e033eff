#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace ovrin {

/// How the program adds lines to a file of somebody else's. Marks around them tell whose they are, and all
/// that is needed to have the file as it was, byte for byte, when they are taken out again:
///
///     # >>> ovrin setup 1a2b3c4d >>> "ovrin setup --undo" takes this out
///     *.ovrin merge=ovrin
///     # <<< ovrin setup <<<
///
/// The number is a checksum of the lines between. The first mark may stand behind the first of the lines, for
/// files of sections: git forgets with a section all comments that follow it, up to the next header.

/// What the first mark tells about the file as it was.
struct BlockOrigin {
    bool madeFile = false;     ///< there was none
    unsigned madeFolders = 0;  ///< how many of the folders above it were made as well
    bool hadNoLineEnd = false; ///< the text in front of the block had no line end, which was added
};

/// Where the block stands in a text.
struct MarkedBlock {
    std::size_t begin; ///< of its first line
    std::size_t end;   ///< behind its last line
    std::string lines; ///< those between the marks, as they stand there
    BlockOrigin origin;
    bool isUnchanged; ///< the lines are those that were written
};

/// Whether the first of the marks stands behind a line or on a line of its own.
enum class FirstMark { OnItsOwnLine, BehindTheFirstLine };

/// The first block of the text, which is that of `path`. Throws Failure where its last mark is missing.
std::optional<MarkedBlock> FindBlock(std::string_view text, const std::string& path);

/// `lines`, each with its line end, between their marks.
std::string MarkLines(const std::string& lines, const BlockOrigin& origin, FirstMark mark);

/// The text with the block added behind `position`, which is a line's begin or the text's end. The lines get
/// the line ends of the text.
std::string AddBlock(const std::string& text, std::size_t position, const std::string& lines,
                     BlockOrigin origin, FirstMark mark);

/// The text with other lines in the block, which keeps its place, its origin and its kind of line ends.
std::string ReplaceBlock(const std::string& text, const MarkedBlock& block, const std::string& lines,
                         FirstMark mark);

/// The text without the block, but with `kept` in its place.
std::string RemoveBlock(const std::string& text, const MarkedBlock& block, const std::string& kept = {});

} // namespace ovrin
