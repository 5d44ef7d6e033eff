#include "Writing/ScalarStyle.h"

#include "Values/YAMLScalar.h"
#include "Writing/WrittenForm.h"

namespace ovrin_yaml {

namespace {

using enum Meaning::Bits;

/// Whitespace other than these two is special, which decides before anyone asks.
bool IsSpace(char c) {
    return c == ' ' || c == '\n';
}

bool Contains(std::string_view text, std::string_view part) {
    return text.find(part) != std::string_view::npos;
}

/// The first characters mean something in a block and in a flow collection.
bool BeginsWithIndicator(std::string_view text) {
    const unsigned first = MeaningsOf(text.front());
    if (first & kLeading) return true;
    if ((first & kLeadingSpaced) && (text.size() == 1 || IsSpace(text[1]))) return true;
    return IsLikeMark(text);
}

ScalarForms ClassifySpecial(std::string_view text) {
    const bool lineBreaks = text.find_first_of("\n\r") != std::string_view::npos ||
                            Contains(text, "\xC2\x85") || Contains(text, "\xE2\x80\xA8") ||
                            Contains(text, "\xE2\x80\xA9");
    return {false, false, false, lineBreaks};
}

} // namespace

ScalarForms ClassifyScalar(std::string_view text) {
    if (text.empty()) return {true, false, true, false};

    unsigned seen = 0;
    for (const char c : text) seen |= MeaningsOf(c);
    if (seen & kSpecial) return ClassifySpecial(text);
    if (seen & kLineFeed) return {false, false, !Contains(text, " \n") && !Contains(text, "\n "), true};

    ScalarForms forms;
    bool indicator = BeginsWithIndicator(text);
    if (seen & kBlank) {
        indicator |= text.front() == ' ' || text.back() == ' ';
        indicator |= (seen & kColon) && Contains(text, ": ");
        indicator |= (seen & kHash) && Contains(text, " #");
    }
    indicator |= text.back() == ':';
    forms.plainInBlock = !indicator;
    forms.plainInFlow = !indicator && !(seen & kFlowIndicator) && !(seen & kColon);
    return forms;
}

ScalarForms FormsOf(const YAMLScalar& scalar) {
    enum Memo : std::uint8_t {
        kKnown = 1,
        kPlainInBlock = 2,
        kPlainInFlow = 4,
        kSingleQuoted = 8,
        kLineBreaks = 16
    };
    const unsigned memo = scalar.WriterMemo();
    if (memo)
        return {(memo & kPlainInBlock) != 0, (memo & kPlainInFlow) != 0, (memo & kSingleQuoted) != 0,
                (memo & kLineBreaks) != 0};
    const ScalarForms forms = ClassifyScalar(scalar.Value());
    scalar.SetWriterMemo(static_cast<std::uint8_t>(
        kKnown | (forms.plainInBlock ? kPlainInBlock : 0) | (forms.plainInFlow ? kPlainInFlow : 0) |
        (forms.singleQuoted ? kSingleQuoted : 0) | (forms.lineBreaks ? kLineBreaks : 0)));
    return forms;
}

} // namespace ovrin_yaml
