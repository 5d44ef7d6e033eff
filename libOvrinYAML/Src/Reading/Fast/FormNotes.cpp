#include "Reading/Fast/FormNotes.h"

#include "Writing/ScalarStyle.h"

#include <algorithm>
#include <cstring>

namespace ovrin_yaml {

bool FormNotes::NoteKey(std::string_view text) {
    const bool isAsWritten = !IsLikeMark(text) && !text.ends_with(':') && text.size() <= kLongestSimpleKey;
    NoteIf(!isAsWritten);
    return isAsWritten;
}

void FormNotes::NoteQuoted(char quote, std::string_view text, bool inFlow, const char* lineStart) {
    NoteText(text, lineStart);
    const ScalarForms forms = ClassifyScalar(text);
    NoteIf(quote != '\'' || !forms.singleQuoted || (inFlow ? forms.plainInFlow : forms.plainInBlock));
}

void FormNotes::NoteLongText(std::string_view text, const char* lineStart) {
    const char* const end = text.data() + text.size();
    const char* const behindWidth = std::max(text.data(), lineStart + kLineWidth + 1);
    NoteIf(behindWidth < end && std::memchr(behindWidth, ' ', static_cast<std::size_t>(end - behindWidth)));
}

} // namespace ovrin_yaml
