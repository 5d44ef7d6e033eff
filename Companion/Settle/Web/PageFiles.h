#pragma once

#include "Review/PageRequest.h"

#include <optional>
#include <span>
#include <string_view>

namespace ovrin {

/// A file of the page that shows scenes, as it was built into the program.
struct PageFile {
    std::string_view name; ///< "index.html", "main.js"
    std::string_view type; ///< its media type
    std::string_view bytes;
};

/// All of them, in the order of their names.
std::span<const PageFile> PageFiles();

/// The file that a page asks for; the page itself for an empty path. Nothing for any other path.
std::optional<PageAnswer> AnswerPageFile(const PageRequest& request);

} // namespace ovrin
