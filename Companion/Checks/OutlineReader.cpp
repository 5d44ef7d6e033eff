#include "Checks/OutlineReader.h"

#include "Checks/OutlineBuilder.h"
#include "Checks/WrittenSo.h"
#include "Scenes/InOrder.h"

#include "Reading/DocumentCut.h"
#include "Reading/Fast/WrittenFormReader.h"
#include "Session/ReadInputs.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <optional>
#include <span>
#include <string_view>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using Documents = std::vector<std::string_view>;

/// Text that is read at one go: enough for a reader to get to know the common keys, little enough to share
/// out.
constexpr std::size_t kPieceBytes = std::size_t{1} << 20;

Documents Cut(const std::string& text) {
    Documents documents;
    const char* const end = text.data() + text.size();
    for (const char* begin = text.data() + FileHeaderOf(text).size(); begin != end;) {
        const char* next = FindDocumentEnd(begin, end);
        documents.emplace_back(begin, next);
        begin = next;
    }
    return documents;
}

std::vector<std::span<const std::string_view>> PiecesOf(const Documents& documents) {
    std::vector<std::span<const std::string_view>> pieces;
    std::size_t first = 0, bytes = 0;
    for (std::size_t i = 0; i < documents.size(); ++i) {
        bytes += documents[i].size();
        if (bytes < kPieceBytes && i + 1 != documents.size()) continue;
        pieces.push_back(std::span(documents).subspan(first, i + 1 - first));
        first = i + 1;
        bytes = 0;
    }
    return pieces;
}

/// Nothing if the fast reader isn't sure of one of them.
std::optional<Outlines> ReadPiece(const std::string& text, std::span<const std::string_view> documents) {
    WrittenFormReader<OutlineBuilder> reader(text.data() + text.size());
    FormSearch search(text);
    std::vector<bool> areFirst;
    for (const std::string_view document : documents) {
        const auto read = reader.Read(document, 0);
        if (!read.object) return std::nullopt;
        areFirst.push_back(
            search.IsFirst(document, read.isAsWritten && !read.object->hasRepeatedTransitions));
    }
    Outlines outlines = reader.TheBuilder().TakeOutlines();
    for (std::size_t i = 0; i < documents.size(); ++i) {
        outlines.objects[i].begin = static_cast<std::size_t>(documents[i].data() - text.data());
        outlines.objects[i].isAsWritten = !areFirst[i];
    }
    return outlines;
}

std::optional<Outlines> ReadFast(const std::string& text, const Documents& documents) {
    if (!HasWrittenHeader(text)) return std::nullopt;
    const auto pieces = PiecesOf(documents);
    std::optional<Outlines> all(std::in_place);
    ForEachInOrder(
        pieces.size(), [&](std::size_t index) { return ReadPiece(text, pieces[index]); },
        [&](std::size_t, std::optional<Outlines> piece) {
            if (piece && all)
                all->Append(std::move(*piece));
            else
                all.reset();
        });
    return all;
}

/// Hands the parts of trees to a builder, as the fast reader would.
class TreeWalk {
public:
    /// Trees count their lines from the header of the file on.
    explicit TreeWalk(std::uint32_t headerLines) : m_HeaderLines(headerLines) {}

    void Add(const YAMLMapping& object) {
        AddPairs(object);
        bool isStripped = false;
        for (const YAMLMapping::Entry entry : object.RawEntries())
            isStripped |= entry.key == YAMLScalar::strippedPrefabPlaceHolderName;
        m_Builder.CloseMapping(0, object.m_Flow, LineOf(object), isStripped ? 3 : 2);
        m_Builder.TakeObject(isStripped);
    }

    Outlines TakeOutlines() { return m_Builder.TakeOutlines(); }

private:
    std::uint32_t LineOf(const YAMLNode& node) const {
        return node.m_Line - std::min(node.m_Line, m_HeaderLines);
    }

    void AddPairs(const YAMLMapping& mapping) {
        for (const YAMLMapping::Entry entry : mapping.RawEntries()) {
            m_Builder.AddScalar(entry.key);
            AddNode(*entry.value);
        }
    }

    void AddNode(const YAMLNode& node) {
        if (const YAMLScalar* scalar = AsScalar(&node)) return m_Builder.AddScalar(scalar);
        const std::size_t mark = m_Builder.Mark();
        if (const YAMLMapping* mapping = AsMapping(&node)) {
            AddPairs(*mapping);
            m_Builder.CloseMapping(mark, mapping->m_Flow, LineOf(node));
        } else {
            for (const YAMLNode* item : AsSequence(&node)->m_Items) AddNode(*item);
            m_Builder.CloseSequence(mark, false, LineOf(node));
        }
    }

    const std::uint32_t m_HeaderLines;
    OutlineBuilder m_Builder;
};

/// Where objects stand in a text, asked for in the order of the file: the next document with the id of the
/// object. Of documents that say the same, a tree has the first alone.
class DocumentOf {
public:
    DocumentOf(const std::string& text, const Documents& documents) : m_Text(text), m_Documents(documents) {}

    std::string_view operator()(const YAMLScalar& id) {
        while (m_Next < m_Documents.size()) {
            const std::string_view document = m_Documents[m_Next++];
            if (FileIDOf(document) == id.Value()) return document;
        }
        return std::string_view(m_Text).substr(m_Text.size());
    }

private:
    const std::string& m_Text;
    const Documents& m_Documents;
    std::size_t m_Next = 0;
};

Outlines ReadByTrees(const std::string& text, const Documents& documents) {
    OvrinObjects objects;
    const InputFile input = TextInput("the scene", text);
    ReadInputs({{"Read scene", &input, &objects}}, Threads::WhereWorthwhile);
    const std::string_view header = FileHeaderOf(text);
    TreeWalk walk(static_cast<std::uint32_t>(std::count(header.begin(), header.end(), '\n')));
    const auto entries = objects.GetMapping().RawEntries();
    for (const YAMLMapping::Entry entry : entries) walk.Add(ToMapping(entry.value));
    Outlines outlines = walk.TakeOutlines();
    DocumentOf documentOf(text, documents);
    for (std::size_t i = 0; i < entries.size(); ++i) {
        const std::string_view document = documentOf(*entries[i].key);
        outlines.objects[i].begin = static_cast<std::size_t>(document.data() - text.data());
        const YAMLMapping& object = ToMapping(entries[i].value);
        outlines.objects[i].isAsWritten =
            !object.Source().empty() || IsWrittenSo(*entries[i].key, object, document);
    }
    return outlines;
}

} // namespace

Outlines ReadOutlines(const std::string& text) {
    const Documents documents = Cut(text);
    std::optional<Outlines> fast = ReadFast(text, documents);
    Outlines outlines = fast ? std::move(*fast) : ReadByTrees(text, documents);
    // The header of the file goes with its first object.
    if (!HasWrittenHeader(text) && !outlines.objects.empty()) outlines.objects.front().isAsWritten = false;
    return outlines;
}

} // namespace ovrin
