#include "Support/Trees.h"
#include "Writing/YAMLEmitter.h"

#include <gtest/gtest.h>

#include <iterator>
#include <random>
#include <string>
#include <yaml.h>

namespace {

using namespace trees;

/// Random trees of texts that are hard to write. What a switch leaves out is written differently by the
/// library of today.
struct Generator {
    bool emptyValues;   // in block style
    bool finalBreaks;   // texts that end in a line feed
    bool flowAndQuotes; // flow collections, and the quote in texts
    std::mt19937 random;

    int Below(std::size_t limit) { return static_cast<int>(random() % limit); }

    std::string Piece() {
        static const char* const kWords[] = {"a", "word", "m_Name", "1.5", " ", " ", "  ", ":"};
        static const char* const kGroups[] = {": ",     "? ",           "- ",        "---",    "...",
                                              " #",     "\n\n",         "\n ",       " \n",    "\u00E9",
                                              "\uFFFD", "\u0085",       "\u00A0",    "\u2028", "\u2029",
                                              "\uFEFF", "\u65E5\u672C", "\U0001F600"};
        static const std::string kMarks("~=#\"\\-?,[]{}&*!|>%@`\t\r\n\n\x01\x1B\x7F\0", 28);
        if (flowAndQuotes && Below(20) == 0) return "'";
        if (Below(3) != 0) return kWords[Below(std::size(kWords))];
        if (Below(2) != 0) return kGroups[Below(std::size(kGroups))];
        return std::string(1, kMarks[Below(kMarks.size())]);
    }

    std::string Text() {
        std::string text;
        if (Below(4) == 0) {
            for (int words = Below(40); words > 0; --words)
                text.append(std::string(1 + Below(12), 'w')).append(Below(8) ? " " : "  ");
        }
        for (int pieces = Below(7); pieces > 0; --pieces) text += Piece();
        if (finalBreaks && Below(2) == 0) text.insert(0, "a").append(1 + Below(3), '\n');
        return text;
    }

    std::string Value() {
        std::string text = Text();
        if (text.empty() && !emptyValues) text = "v";
        if (text.ends_with('\n') && !finalBreaks) text += "end";
        return text;
    }

    std::string Key() {
        std::string text = Text();
        return text.ends_with('\n') && !finalBreaks ? text + "end" : text;
    }

    Tree Node(int depth) {
        const int kind = depth == 0 ? 0 : Below(4);
        const bool flow = flowAndQuotes && Below(3) == 0;
        if (kind < 2) return std::string_view(Value());
        YAMLMapping* mapping = Mapping({}, flow);
        YAMLSequence* sequence = Sequence({}, flow);
        for (int children = Below(5); children > 0; --children) {
            if (kind == 2)
                mapping->Append(YAMLScalar::Lookup(Key()), Node(depth - 1));
            else
                sequence->m_Items.push_back(Node(depth - 1));
        }
        return kind == 2 ? static_cast<YAMLNode*>(mapping) : sequence;
    }
};

int Populate(yaml_document_t& document, const YAMLNode& node) {
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        const auto style = mapping->m_Flow ? YAML_FLOW_MAPPING_STYLE : YAML_ANY_MAPPING_STYLE;
        const int index = yaml_document_add_mapping(&document, nullptr, style);
        for (const auto& [key, value] : mapping->RawEntries()) {
            const int keyIndex = Populate(document, *key);
            yaml_document_append_mapping_pair(&document, index, keyIndex, Populate(document, *value));
        }
        return index;
    }
    if (const YAMLSequence* sequence = AsSequence(&node)) {
        const auto style = sequence->m_Flow ? YAML_FLOW_SEQUENCE_STYLE : YAML_BLOCK_SEQUENCE_STYLE;
        const int index = yaml_document_add_sequence(&document, nullptr, style);
        for (const YAMLNode* item : sequence->m_Items)
            yaml_document_append_sequence_item(&document, index, Populate(document, *item));
        return index;
    }
    const std::string text(AsScalar(&node)->Value());
    return yaml_document_add_scalar(&document, nullptr, reinterpret_cast<const yaml_char_t*>(text.data()),
                                    static_cast<int>(text.size()), YAML_ANY_SCALAR_STYLE);
}

int AppendTo(void* text, unsigned char* bytes, std::size_t size) {
    static_cast<std::string*>(text)->append(reinterpret_cast<const char*>(bytes), size);
    return 1;
}

/// The node as the YAML library of today writes it.
std::string LibraryText(const YAMLNode& node) {
    yaml_document_t document;
    yaml_emitter_t emitter;
    std::string text;
    yaml_document_initialize(&document, nullptr, nullptr, nullptr, 1, 1);
    yaml_emitter_initialize(&emitter);
    yaml_emitter_set_output(&emitter, AppendTo, &text);
    Populate(document, node);
    EXPECT_TRUE(yaml_emitter_open(&emitter) && yaml_emitter_dump(&emitter, &document));
    yaml_emitter_flush(&emitter);
    yaml_emitter_delete(&emitter);
    return text;
}

/// Ours, as a whole document and without the mark that only we put behind plain roots.
std::string OurText(const YAMLNode& node) {
    std::string text = GetYAMLString(node);
    if (AsScalar(&node) && text.ends_with("\n...") && text[0] != '\'' && text[0] != '"')
        text.resize(text.size() - 4);
    return text + "\n";
}

std::string WithoutBlanksAtLineEnds(std::string text) {
    for (std::size_t at; (at = text.find(" \n")) != std::string::npos;) text.erase(at, 1);
    return text;
}

/// Only quoted texts have empty lines, so a quote that opens a line behind one closes a text.
std::string WithClosingQuotesAtColumn0(std::string text) {
    for (std::size_t at = 0; (at = text.find("\n\n", at)) != std::string::npos; ++at) {
        const std::size_t end = text.find_first_not_of(' ', at + 2);
        if (end != std::string::npos && text[end] == '\'') text.erase(at + 2, end - at - 2);
    }
    return text;
}

TEST(EmitterOracle, AgreesWithTheLibrary) {
    for (unsigned seed = 0; seed < 20000; ++seed) {
        const Tree tree = Generator{false, false, true, std::mt19937(seed)}.Node(4);
        ASSERT_EQ(OurText(*tree.node), LibraryText(*tree.node)) << "seed " << seed;
    }
}

TEST(EmitterOracle, DiffersInTheBlankBeforeAnEmptyValue) {
    for (unsigned seed = 0; seed < 3000; ++seed) {
        const Tree tree = Generator{true, false, true, std::mt19937(seed)}.Node(3);
        ASSERT_EQ(WithoutBlanksAtLineEnds(OurText(*tree.node)), LibraryText(*tree.node)) << "seed " << seed;
    }
}

TEST(EmitterOracle, DiffersInTheColumnOfAQuoteBehindALineBreak) {
    for (unsigned seed = 0; seed < 3000; ++seed) {
        const Tree tree = Generator{false, true, false, std::mt19937(seed)}.Node(3);
        const std::string library = WithClosingQuotesAtColumn0(LibraryText(*tree.node));
        ASSERT_EQ(OurText(*tree.node), library) << "seed " << seed;
    }
}

} // namespace
