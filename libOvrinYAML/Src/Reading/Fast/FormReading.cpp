#include "Reading/Fast/FormReading.h"

#include <algorithm>

namespace ovrin_yaml {

static_assert(kLongestSimpleKey <= KnownKey::kLongest, "what the writer writes can be guessed");

void FormReading::Begin(std::string_view text, std::uint32_t firstLine) {
    cursor.Begin(text, firstLine);
    notes.Begin();
    depth = 0;
}

KnownKey& FormReading::AddKey(const char* end, const KnownKey& parent, KeyGuess& guess) {
    const std::string_view text(cursor.Position(), end);
    YAMLScalar* scalar = builder.Intern(text);
    builder.AddScalar(scalar);
    cursor.MoveTo(end + 1);
    const bool isWritten = notes.NoteKey(text);
    const bool isSame = IsPlainStart(text[0]) && std::all_of(text.begin(), text.end(), IsPlainInFlow);
    return isWritten && isSame ? keys.Learn(parent, scalar, guess) : keys.Unknown();
}

void FormReading::AddQuoted(bool inFlow) {
    const std::string_view text = quoted.Read(inFlow);
    // One that doesn't stand in the document will not stay.
    if (quoted.Holds(text))
        builder.AddScalar(YAMLScalar::Lookup(text));
    else
        builder.AddText(text);
}

} // namespace ovrin_yaml
