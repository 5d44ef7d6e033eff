#pragma once

#include "Writing/ScalarStyle.h"
#include "Writing/TextOutput.h"

#include <string_view>

namespace ovrin_yaml {

/// How a scalar may be spread over lines.
struct Folding {
    bool allowed;
    int indent; // of the lines behind the first
};

/// Write a scalar's text in one style, which the text must allow, quotes included.
///
/// A blank beyond column 80 becomes a line break if folding is allowed and no other blank stands beside it;
/// the blanks at the text's ends stay. In double quotes a blank may follow: a backslash then keeps it.
void WritePlain(TextOutput& output, std::string_view text, Folding folding);
/// Line feeds stand for themselves: one in the text is an empty line, n in a row are n empty lines. A quote
/// behind a final line feed closes at column 0.
void WriteSingleQuoted(TextOutput& output, std::string_view text, Folding folding);
/// All but printable ASCII is escaped, a byte that is no part of valid UTF-8 as if it were a character.
void WriteDoubleQuoted(TextOutput& output, std::string_view text, Folding folding);
/// Writes in the first of these styles that is allowed: plain if `plainAllowed`, the quoted ones as the
/// text's `forms` tell.
void WriteScalar(TextOutput& output, std::string_view text, ScalarForms forms, bool plainAllowed,
                 Folding folding);

} // namespace ovrin_yaml
