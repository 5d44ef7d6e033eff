#include "Support/RandomDocuments.h"

#include <algorithm>

namespace random_documents {

std::string RandomDocuments::Key() {
    static constexpr std::string_view kKeys[] = {"m_Name",  "m_Father", "fileID", "a b",
                                                 "x",       "first",    "a:b",    "k.1",
                                                 "data[0]", "a?",       "-a",     "m_PrefabInternal"};
    static constexpr std::string_view kOddKeys[] = {"'q: r'", "a ", "...", "---x", "a:", "? a\n", "\"e\""};
    return std::string(Below(60) ? OneOf(kKeys) : OneOf(kOddKeys)) +
           (Below(8) ? std::to_string(Below(50)) : "");
}

std::string RandomDocuments::Body() {
    static constexpr std::string_view kClasses[] = {"Transform", "GameObject", "AnimatorStateMachine", "A"};
    m_Text = std::string(OneOf(kClasses)) + ":\n  ";
    AddMapping(2, 3);
    return m_Text;
}

void RandomDocuments::AddMapping(int indent, int depth) {
    for (std::size_t left = 1 + Below(4);; --left) {
        m_Text += Key() + ":";
        AddValue(indent, depth);
        if (left == 1) return;
        m_Text.append(static_cast<std::size_t>(indent), ' ');
    }
}

/// From behind the colon or dash up to the line end.
void RandomDocuments::AddValue(int indent, int depth) {
    const std::size_t kind = depth == 0 ? 4 + Below(8) : Below(12);
    if (kind == 0) {
        m_Text.append("\n").append(static_cast<std::size_t>(indent) + 2, ' ');
        AddMapping(indent + 2, depth - 1);
    } else if (kind <= 2) {
        m_Text += '\n';
        AddItems(indent, depth - 1);
    } else if (kind <= 5) {
        m_Text += ' ';
        AddFlow(indent + 2, depth);
        m_Text += '\n';
    } else {
        m_Text += Below(100) ? " " : "";
        AddScalar(indent + 2);
        m_Text += '\n';
    }
}

void RandomDocuments::AddItems(int indent, int depth) {
    for (std::size_t left = 1 + Below(4); left > 0; --left) {
        m_Text.append(static_cast<std::size_t>(indent), ' ').append("-");
        const std::size_t kind = depth <= 0 ? 5 : Below(6);
        if (kind == 0) {
            m_Text += ' ';
            AddMapping(indent + 2, depth - 1);
        } else if (kind == 1) {
            m_Text += " - a\n" + std::string(static_cast<std::size_t>(indent) + 2, ' ') + "- b\n";
        } else {
            AddValue(indent, 0);
        }
    }
}

void RandomDocuments::AddScalar(int indent) {
    static constexpr std::string_view kScalars[] = {"",
                                                    "0",
                                                    "-1.5",
                                                    "a b  c",
                                                    "http://a:b#c",
                                                    "'a: b'",
                                                    "' x '",
                                                    "'it''s'",
                                                    "'#'",
                                                    "'- a'",
                                                    "a, [b]",
                                                    "-a",
                                                    "'...'",
                                                    "\"\\t\\x41\\u00e9\"",
                                                    "\"a\\\n    b\"",
                                                    "''",
                                                    "0123456789abcdef0123456789abcdef"};
    static constexpr std::string_view kOddScalars[] = {
        "'plain'",  "\"q\"",       "a # b", "a#",   "a:", "- b",       "? c",
        "\xC3\xA9", "|\n      t",  "!t u",  "&a v", "*a", "a\n     b", "'a\n\n  b'",
        "a \tb",    "\"\\ud800\"", "---",   "~",    " x"};
    const std::size_t kind = Below(20);
    if (kind == 0)
        m_Text += OneOf(kOddScalars);
    else if (kind <= 3)
        AddWords(indent, kind == 3 ? "" : kind == 2 ? "'" : "\"");
    else
        m_Text += OneOf(kScalars);
}

/// A text of some lines that are mostly broken where the writer breaks them.
void RandomDocuments::AddWords(int indent, std::string_view quote) {
    m_Text += quote;
    m_Text += quote.empty() ? "w" : "w:";
    for (std::size_t words = 5 + Below(40); words > 0; --words) {
        if (Below(100) ? Column() > 80 : true)
            m_Text.append("\n").append(static_cast<std::size_t>(indent), ' ');
        else
            m_Text += ' ';
        m_Text.append(1 + Below(9), 'w');
    }
    m_Text += quote;
}

/// `indent` is where the collection goes on in a new line.
void RandomDocuments::AddFlow(int indent, int depth) {
    const bool isMapping = Below(2);
    m_Text += isMapping ? '{' : '[';
    for (std::size_t left = Below(Below(4) ? 4 : 14); left > 0; --left) {
        if (isMapping) m_Text += (Below(40) ? "k" + std::to_string(Below(30)) : Key()) + ": ";
        AddFlowEntry(indent, depth);
        if (left == 1) break;
        m_Text += ',';
        if (Below(100) ? Column() > 80 : true)
            m_Text.append("\n").append(static_cast<std::size_t>(indent), ' ');
        else
            m_Text += Below(100) ? " " : "";
    }
    m_Text += isMapping ? '}' : ']';
}

void RandomDocuments::AddFlowEntry(int indent, int depth) {
    static constexpr std::string_view kTexts[] = {"0",  "-1",      "'a:b'", "'a, b'", "a b", "'?'",
                                                  "''", "\"\\n\"", "'x'",   "a?",     ""};
    if (depth > 0 && Below(6) == 0)
        AddFlow(indent + 2, depth - 1);
    else
        m_Text += Below(4) ? std::to_string(m_Random()) : std::string(OneOf(kTexts));
}

std::string RandomDocuments::Characters(std::size_t count) {
    std::string characters(count, ' ');
    for (char& c : characters) c = static_cast<char>(' ' + Below(95));
    return characters;
}

std::string RandomDocuments::Damaged(std::string text) {
    static constexpr std::string_view kPieces[] = {": ", "#",  " #",       "'",   "\"", "\n", " ", "-", "- ",
                                                   "\t", "?",  "\xC3\xA9", "&a ", "*a", "{",  "}", "[", "]",
                                                   ",",  "\\", "...",      "---", "\r", "  ", "!"};
    for (std::size_t left = 1 + Below(3); left > 0 && !text.empty(); --left) {
        const std::size_t at = Below(text.size());
        switch (Below(5)) {
        case 0:
            text[at] = static_cast<char>(text[at] ^ 1 << Below(8));
            break;
        case 1:
            text.erase(at, 1 + Below(4));
            break;
        case 2:
            if (Below(8) == 0) text.resize(at);
            break;
        default:
            text.insert(at, OneOf(kPieces));
        }
    }
    return text;
}

} // namespace random_documents
