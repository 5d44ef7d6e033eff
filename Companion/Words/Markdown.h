#pragma once

#include <string>
#include <string_view>

namespace ovrin {

/// A text of one line as Markdown shows it letter by letter: between backticks, more of them than the text
/// has in a row. Nothing in it is markup, a mention of somebody or a link.
std::string CodeSpan(std::string_view text);

} // namespace ovrin
