#include "Support/Documents.h"

#include "Reading/DocumentLoader.h"
#include "Reading/ObjectFileReader.h"
#include "Writing/CheckTree.h"
#include "Writing/ObjectFileWriter.h"

#include <gtest/gtest.h>

#include <sstream>

namespace documents {

namespace {

/// The library must be ready before the first test asks for a scalar.
const bool g_IsInitialized = (initialize(), true);

std::string Join(const YAMLNode* node, const char* brackets, std::string (*show)(const YAMLNode*)) {
    std::string text(1, brackets[0]);
    const auto separate = [&] { text += text.size() > 1 ? ", " : ""; };
    if (const YAMLMapping* mapping = AsMapping(node)) {
        for (const auto& [key, value] : mapping->RawEntries()) {
            if (!key) continue;
            separate();
            text += std::string(key->Value()) + ": " + show(value);
        }
    } else {
        for (const YAMLNode* item : AsSequence(node)->m_Items) {
            separate();
            text += show(item);
        }
    }
    return text + brackets[1];
}

} // namespace

YAMLNode* Node(const std::string& text) {
    AliasBudget budget;
    return LoadDocument(text, budget).root;
}

YAMLMapping* Doc(const std::string& text) {
    return text.empty() ? YAMLAlloc<YAMLMapping>::create() : &ToMapping(Node(text));
}

YAMLSequence* List(const std::string& text) {
    return &ToSequence(Node(text));
}

Path PathOf(const std::string& text) {
    Path path;
    std::istringstream stream(text);
    for (std::string element; std::getline(stream, element, '.');)
        path.push_back(YAMLScalar::Lookup(element));
    return path;
}

std::string Show(const YAMLNode* node) {
    if (!node) return "~";
    if (const YAMLScalar* scalar = AsScalar(node)) return std::string(scalar->Value());
    return Join(node, AsMapping(node) ? "{}" : "[]", Show);
}

std::string Dump(const YAMLNode* node) {
    if (const YAMLScalar* scalar = AsScalar(node)) return "'" + std::string(scalar->Value()) + "'";
    const YAMLMapping* mapping = AsMapping(node);
    const bool flow = mapping ? mapping->m_Flow : AsSequence(node)->m_Flow;
    const std::string where = std::to_string(node->m_Line) + "#" + std::to_string(node->m_Hash);
    return where +
           (mapping && mapping->HasDuplicates() ? "!"
            : mapping                           ? ":"
                                                : "-") +
           Join(node, flow ? "[]" : "<>", Dump);
}

std::string ObjectText(const std::string& documents) {
    return "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n" + documents;
}

std::string Written(const OvrinObjects& objects) {
    EXPECT_EQ(CheckTree(objects.GetMapping(), TreeStage::Changed), "");
    std::ostringstream stream;
    Output(objects, stream);
    return stream.str();
}

std::string ReadError(const std::string& text) {
    OvrinObjects objects;
    return ErrorOf([&] { ParseYAMLFile(text, objects); });
}

std::string ReadAndWrite(const std::string& text) {
    OvrinObjects objects;
    ParseYAMLFile(text, objects);
    EXPECT_EQ(CheckTree(objects.GetMapping(), TreeStage::Hashed), "");
    return Written(objects);
}

} // namespace documents
