#pragma once

#include "Settle/Web/PageFiles.h"

#include <span>
#include <string>
#include <string_view>

namespace ovrin {

/// The page and its data as one file of HTML that asks for nothing else: a content security policy in it
/// forbids all but its own script and style, by a random number that is another one each time. `data` is JSON
/// and stands in an element `<script type="application/json" id="data">`, where nothing in it is taken for
/// markup. Throws Failure for files that are no page.
std::string SinglePage(std::span<const PageFile> files, std::string_view data);

/// JSON text without letters that mean something in HTML, or end a line in a script alone: `<`, `>`, `&` and
/// U+2028 and U+2029 stand as escapes. Bytes that are no UTF-8 must not be in it.
std::string SafeInScript(std::string_view data);

} // namespace ovrin
