// The reader of documents against the YAML library's own loader and the plainest conversion of its nodes.

#include "Reading/DocumentLoader.h"
#include "Support/Documents.h"
#include "Values/Hash.h"

#include <gtest/gtest.h>

#include <random>
#include <vector>
#include <yaml.h>

namespace {

using namespace documents;

std::string Text(const yaml_char_t* text) {
    return reinterpret_cast<const char*>(text);
}

/// Converts the nodes of a loaded document; throws where an alias contains itself.
struct Converter {
    yaml_document_t& document;
    std::vector<int> open = {};

    YAMLNode* Convert(int index) {
        const yaml_node_t& node = *yaml_document_get_node(&document, index);
        if (node.type == YAML_SCALAR_NODE)
            return YAMLScalar::Lookup(
                {reinterpret_cast<const char*>(node.data.scalar.value), node.data.scalar.length});
        if (std::count(open.begin(), open.end(), index)) throw YAMLError("Recursive alias");
        open.push_back(index);
        YAMLNode* result = node.type == YAML_MAPPING_NODE ? Mapping(node) : Sequence(node);
        open.pop_back();
        result->m_Line = static_cast<std::uint32_t>(node.start_mark.line);
        return result;
    }

    YAMLNode* Mapping(const yaml_node_t& node) {
        auto* mapping = YAMLAlloc<YAMLMapping>::create(node.data.mapping.style == YAML_FLOW_MAPPING_STYLE);
        std::uint32_t hash = 0, index = 0;
        const auto& pairs = node.data.mapping.pairs;
        for (const yaml_node_pair_t* pair = pairs.start; pair < pairs.top; ++pair, ++index) {
            YAMLNode* key = Convert(pair->key);
            YAMLNode* value = Convert(pair->value);
            if (!AsScalar(key)) continue;
            mapping->Append(AsScalar(key), value);
            hash = FoldPair(hash, key->m_Hash, value->m_Hash, index);
        }
        mapping->m_Hash = hash;
        return mapping;
    }

    YAMLNode* Sequence(const yaml_node_t& node) {
        auto* sequence =
            YAMLAlloc<YAMLSequence>::create(node.data.sequence.style == YAML_FLOW_SEQUENCE_STYLE);
        std::uint32_t hash = 0, index = 0;
        const auto& items = node.data.sequence.items;
        for (const yaml_node_item_t* item = items.start; item < items.top; ++item) {
            sequence->m_Items.push_back(Convert(*item));
            hash = FoldItem(hash, sequence->m_Items.back()->m_Hash, index++);
        }
        sequence->m_Hash = hash;
        return sequence;
    }
};

std::string Problem(const yaml_parser_t& parser) {
    std::string problem = parser.problem;
    if (parser.error == YAML_READER_ERROR) problem[0] = static_cast<char>(std::toupper(problem[0]));
    return problem;
}

/// All that is known of the first document, or its failure.
std::string Expected(const std::string& text) {
    yaml_parser_t parser;
    yaml_document_t document;
    yaml_parser_initialize(&parser);
    yaml_parser_set_input_string(&parser, reinterpret_cast<const unsigned char*>(text.data()), text.size());
    std::string result;
    if (!yaml_parser_load(&parser, &document)) {
        result = Problem(parser);
    } else {
        const yaml_node_t* root = yaml_document_get_root_node(&document);
        result = root ? "" : "nothing";
        if (root) try {
                result = Dump(Converter{document}.Convert(1)) + " " + Text(root->tag) + " at " +
                         std::to_string(parser.mark.index);
            } catch (const YAMLError& error) {
                result = error.what();
            }
        yaml_document_delete(&document);
    }
    yaml_parser_delete(&parser);
    return result;
}

std::string Actual(const std::string& text) {
    std::string result;
    const std::string error = ErrorOf([&] {
        AliasBudget budget;
        const LoadedDocument document = LoadDocument(text, budget);
        if (!document.aliasFailure.empty()) throw YAMLError(document.aliasFailure);
        result = !document.root
                     ? "nothing"
                     : Dump(document.root) + " " + document.tag + " at " + std::to_string(document.stoppedAt);
    });
    return error == "none" ? result : error;
}

/// Texts that are mostly YAML: documents by a small grammar, in which now and then something is broken.
struct TextGenerator {
    std::mt19937 random;
    int anchors = 0;

    std::size_t Below(std::size_t limit) { return random() % limit; }

    std::string Scalar() {
        static const std::vector<std::string> kScalars = {
            "a",         "m_Name",         "1.5",    "''",      "'it''s'", "\"x\\n\\u00e9\"",
            "two words", "\u65E5\u672C",   "",       "- dash",  "a: b",    "'two\n\n  lines'",
            "~",         "\"\\\n   cut\"", "!tag x", "!!str y", "# none",  "many words\n   over lines"};
        return kScalars[Below(3) ? Below(4) : Below(kScalars.size())];
    }

    std::string Properties() {
        if (Below(8) == 0) return "&n" + std::to_string(anchors++) + " ";
        return Below(40) == 0 ? "!t " : "";
    }

    std::string Flow(int depth) {
        if (anchors && Below(6) == 0) return "*n" + std::to_string(Below(anchors)) + " ";
        if (depth == 0 || Below(2)) return Properties() + Scalar();
        const bool mapping = Below(2);
        std::string text = Properties() + (mapping ? "{" : "[");
        for (std::size_t count = Below(4); count > 0; --count)
            text +=
                (mapping ? Flow(Below(8) ? 0 : 1) + ": " : "") + Flow(depth - 1) + (count > 1 ? ", " : "");
        return text + (mapping ? "}" : "]");
    }

    std::string Block(int depth, const std::string& indent) {
        const bool mapping = Below(3);
        std::string text;
        for (std::size_t count = 1 + Below(4); count > 0; --count) {
            const bool explicitKey = mapping && Below(10) == 0;
            text += indent + (explicitKey ? "? " + Flow(1) + "\n" + indent + ":"
                              : mapping   ? Flow(0) + ":"
                                          : "-");
            if (depth > 0 && Below(2))
                text += " " + Properties() + "\n" + Block(depth - 1, indent + "  ");
            else
                text += " " + Flow(2) + (Below(9) ? "\n" : Below(2) ? "\r\n" : " # why\n");
        }
        return text;
    }

    std::string Document() {
        anchors = 0;
        static const char* const kHeaders[] = {"--- !o!1 &2\n", "--- &2\n", "", "---\n",
                                               "# why\n\n--- !o!4 &7 \n"};
        static const char* const kEnds[] = {"", "---", "...\n", "--- !o!4 &8\n", "...\n# why\n", "\n\n"};
        std::string text =
            std::string(Below(8) ? "%YAML 1.1\n%TAG !o! tag:x,1:\n--- !o!1 &2\n" : kHeaders[Below(5)]) +
            Block(3, "") + kEnds[Below(6)];
        for (std::size_t faults = Below(3) ? 0 : 1 + Below(3); faults > 0; --faults) {
            static const std::string kBytes(" :-'\"{}[]&*!?#,\n\t|>%@\x01\xc3\xff");
            const std::size_t at = Below(text.size());
            if (Below(2))
                text.erase(at, 1 + Below(5));
            else
                text.insert(at, 1, kBytes[Below(kBytes.size())]);
            if (text.empty()) text = "a";
        }
        return text;
    }
};

TEST(LoaderOracle, TreesHashesLinesAndProblemsAreTheLibrarysOwn) {
    TextGenerator generator{std::mt19937(20240601)};
    int trees = 0, problems = 0;
    for (int i = 0; i < 20000; ++i) {
        const std::string text = generator.Document();
        const std::string expected = Expected(text);
        ASSERT_EQ(Actual(text), expected) << "text " << i << "\n" << text;
        ++(expected.find('#') == std::string::npos ? problems : trees);
    }
    EXPECT_GT(trees, 3000);
    EXPECT_GT(problems, 2000) << "the generator should break some";
}

} // namespace
